#include "LogGenerator/Orbel/GSM/EquivalentPLMNList.h"

#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

namespace
{

constexpr std::uint32_t equivalentPLMNLogCode = 0x7150;

// Network, 6 bytes of one decimal digit each, country and network code taking turns
//   0, 2, 4 country code | 1, 3, 5 network code
PlistDictionary row(const LogPacket& plmn)
{
    return {{"Mobile Country Code", decimal(plmn.u8(0) * 100 + plmn.u8(2) * 10 + plmn.u8(4))},
            {"Mobile Network Code", decimal(plmn.u8(1) * 100 + plmn.u8(3) * 10 + plmn.u8(5))}};
}

} // namespace

std::string_view EquivalentPLMNList::getSectionName() const
{
    return "Equivalent PLMN List";
}

std::vector<std::uint32_t> EquivalentPLMNList::getLogCodeArray() const
{
    return {equivalentPLMNLogCode};
}

// Equivalent PLMNs, 0x7150, at least 17 bytes
//   16 u8 number of networks | 17 networks, 3 bytes apart: the second half of one is the first half
//   of the next
void EquivalentPLMNList::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Equivalent PLMN List");
    if (logCode != equivalentPLMNLogCode)
        return logUnknownMessage(logCode);
    if (packet.size() < 17)
        return;
    clearRows();

    const RecordElements plmns{17, 3, packet.u8(16), 6};
    PlistArray rows;
    for (std::size_t i = 0; i < plmns.completeIn(packet); ++i)
        rows.append(row(plmns.element(packet, i)));
    showRows(rows);
}

} // namespace ventrik
