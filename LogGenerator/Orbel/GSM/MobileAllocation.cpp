#include "LogGenerator/Orbel/GSM/MobileAllocation.h"

#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

namespace
{

constexpr std::uint32_t mobileAllocationLogCode = 0x51F8;

} // namespace

std::string_view MobileAllocation::getSectionName() const
{
    return "Mobile Allocation";
}

std::vector<std::uint32_t> MobileAllocation::getLogCodeArray() const
{
    return {mobileAllocationLogCode};
}

// Mobile allocation, 0x51F8, at least 15 bytes
//   13 u8 hopping sequence number | 14 u8 k | 15 k ARFCNs, u16 each
void MobileAllocation::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("MobileAllocation");
    if (logCode != mobileAllocationLogCode)
        return logUnknownMessage(logCode);
    if (packet.size() < 15)
        return;
    show("HSN", decimal(packet.u8(13)));

    const RecordElements frequencies{15, 2, packet.u8(14), 2};
    PlistArray arfcns;
    for (std::size_t i = 0; i < frequencies.completeIn(packet); ++i)
        arfcns.append(decimal(frequencies.element(packet, i).u16(0)));
    show("ARFCNs", arfcns);
}

} // namespace ventrik
