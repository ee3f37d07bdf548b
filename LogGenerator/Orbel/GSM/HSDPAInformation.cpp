#include "LogGenerator/Orbel/GSM/HSDPAInformation.h"

#include "LogGenerator/Orbel/Labels.h"
#include "LogGenerator/Orbel/ValueText.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::uint32_t hsdpaLogCode = 0x4221;

constexpr std::array<std::string_view, 4> carrierLabels{"Single Carrier", "MIMO", "Dual Carrier",
                                                        "Reserved"};

// HARQ process, 9 bytes
//   0 u8 identity | 1 u32 received bits | 5 u16 new transmissions | 7 u16 block errors
PlistDictionary row(const LogPacket& process)
{
    return {{"Process ID", unsignedDecimal(process.u8(0))},
            {"No Rx Bits", unsignedDecimal(process.u32(1))},
            {"New Tx", unsignedDecimal(process.u16(5))},
            {"Block Errors", unsignedDecimal(process.u16(7))}};
}

PlistArray rowsOf(const LogPacket& packet, const RecordElements& processes)
{
    PlistArray rows;
    for (std::size_t i = 0; i < processes.completeIn(packet); ++i)
        rows.append(row(processes.element(packet, i)));
    return rows;
}

} // namespace

std::string_view HSDPAInformation::getSectionName() const
{
    return "HSDPA Info";
}

std::vector<std::uint32_t> HSDPAInformation::getLogCodeArray() const
{
    return {hsdpaLogCode};
}

// HSDPA, 0x4221, at least 18 bytes
//   13 u8 version | 14 sub-frames, 10 bits | 15 bits 2 to 3 carrier configuration
//   16 u8 P, primary HARQ processes | 17 u8 S, secondary ones
//   18 P elements of 9 bytes | 18 + 162 P: S elements of 9 bytes
// The record keeps room for 18 elements behind each primary process, whatever it fills.
void HSDPAInformation::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("HSDPA Info");
    if (logCode != hsdpaLogCode || packet.size() < 18)
        return;
    show("Version", unsignedDecimal(packet.u8(13)));
    show("Sub Frames", unsignedDecimal(packet.u16(14) & 0x3FF));
    show("Carrier Info", labelOr(carrierLabels, packet.u8(15) >> 2 & 3, "Reserved"));

    const std::size_t primaryCount = packet.u8(16);
    const std::size_t secondaryCount = packet.u8(17);
    if (primaryCount > 0)
        show("Primary HARQ Process", rowsOf(packet, {18, 9, primaryCount, 9}));
    if (secondaryCount > 0)
        show("Secondary HARQ Process",
             rowsOf(packet, {18 + 162 * primaryCount, 9, secondaryCount, 9}));
}

} // namespace ventrik
