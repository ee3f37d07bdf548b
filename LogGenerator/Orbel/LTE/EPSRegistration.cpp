#include "LogGenerator/Orbel/LTE/EPSRegistration.h"

#include "Packets/LTEStateRecords.h"

namespace ventrik
{

namespace
{

using namespace LTEStateRecords;

constexpr SectionTable table{
    .name = "EPS Registration",
    .records = {{{.record = &emm}}},
};

} // namespace

EPSRegistration::EPSRegistration(SystemLog& log) : Base(log, table) {}

void EPSRegistration::decode(const ShownRecord&, const LogPacket& packet)
{
    constexpr std::int64_t noNetwork = 0;
    constexpr std::int64_t emptyNetwork = 0xFFFFFF;
    const auto number = [&](std::string_view name) { return numberOf(packet, *emm.find(name)); };
    const auto showAll = [&](std::span<const Field> fields) {
        for (const Field& field : fields)
            show(field, numberOf(packet, field));
    };
    showAll(emmStateFields);
    const auto state = static_cast<std::size_t>(numberOf(packet, emmState));
    if (state < emmSubStates.size() && !emmSubStates[state].key.empty())
        showAll(std::span(&emmSubStates[state], 1));
    if (number("network") != noNetwork && number("network") != emptyNetwork)
        showAll(emmNetworkFields);
    if (number("has identity") == 1)
        showAll(emmIdentityFields);
}

} // namespace ventrik
