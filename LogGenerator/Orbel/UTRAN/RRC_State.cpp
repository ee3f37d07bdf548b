#include "LogGenerator/Orbel/UTRAN/RRC_State.h"

#include <array>
#include <optional>

namespace ventrik
{

namespace
{

constexpr std::uint32_t stateLogCode = 0xD0E0;
constexpr std::size_t expectedSize = 15;
constexpr std::uint8_t noState = 255;

constexpr std::array<std::string_view, 6> stateLabels{"Disconnected", "Connecting", "Cell Fach",
                                                      "Cell DCH",     "Cell PCH",   "Cell URA PCH"};

std::string_view stateLabel(std::uint8_t state)
{
    return state < stateLabels.size() ? stateLabels[state] : "Unknown RRC Mode";
}

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

std::string_view RRC_State::getSectionName() const
{
    return "RRC Info";
}

std::vector<std::uint32_t> RRC_State::getLogCodeArray() const
{
    return {stateLogCode};
}

// RRC state, 0xD0E0, 15 bytes; a shorter record is reported and decoded all the same
//   13 u8 validity, 1: the state counts | 14 u8 state
void RRC_State::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("RRC Info");
    if (logCode != stateLogCode)
        return;
    if (packet.size() < expectedSize)
        log().warning("LogCode_0xD0E0 is length is {} expected size {}", packet.size(),
                      expectedSize);

    const std::uint8_t state = packet.u8(13) == 1 ? packet.u8(14) : noState;
    const std::string_view label = stateLabel(state);
    show("State", label);
    // For whoever watches the console; it has never been a line of the system log.
    log().showOnConsole(fmt::format("Display Dict = {}, rrc mode = {} {}\n",
                                    describe(sectionRef.dictionary()), state, label));
}

} // namespace ventrik
