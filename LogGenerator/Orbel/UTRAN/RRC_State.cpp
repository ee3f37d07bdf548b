#include "LogGenerator/Orbel/UTRAN/RRC_State.h"

#include "Packets/UTRANRecords.h"

#include <optional>

namespace ventrik
{

namespace
{

// A shorter record is reported, and decoded all the same.
constexpr SectionTable table{
    .name = "RRC Info",
    .records = {{{.record = &UTRANRecords::rrcState}}},
    .unknownCode = UnknownCode::Ignored,
    .decodesShortRecords = true,
};

// {Key = text; Key = text}
std::string describe(const std::optional<PlistDictionary>& container)
{
    if (!container)
        return "(null)";
    std::string entries;
    for (const auto& [key, value] : *container)
        entries += fmt::format("{}{} = {}", entries.empty() ? "" : "; ", key,
                               value.string() ? *value.string() : value.kindName());
    return "{" + entries + "}";
}

} // namespace

RRC_State::RRC_State(SystemLog& log) : Base(log, table) {}

void RRC_State::decode(const ShownRecord& shown, const LogPacket& packet)
{
    if (packet.size() < shown.record->minimumSize)
        log().warning("LogCode_0xD0E0 is length is {} expected size {}", packet.size(),
                      shown.record->minimumSize);

    constexpr std::int64_t stateCounts = 1;
    constexpr std::int64_t noState = 255;
    constexpr const Field& validity = UTRANRecords::rrcStateUnshown.front();
    constexpr const Field& field = UTRANRecords::rrcStateFields.front();
    const std::int64_t state =
        numberOf(packet, validity) == stateCounts ? numberOf(packet, field) : noState;
    show(field, state);
    // For whoever watches the console; it has never been a line of the system log.
    log().showOnConsole(fmt::format("Display Dict = {}, rrc mode = {} {}\n",
                                    describe(sectionRef.dictionary()), state,
                                    field.shown.textOf(state).value_or("")));
}

} // namespace ventrik
