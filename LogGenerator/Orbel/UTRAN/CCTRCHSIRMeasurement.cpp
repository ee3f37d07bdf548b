#include "LogGenerator/Orbel/UTRAN/CCTRCHSIRMeasurement.h"

#include "LogGenerator/Orbel/UTRAN/TransportChannelRecord.h"
#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

namespace
{

constexpr std::size_t slotCount = 6;

// Coded composite transport channel, 8 bytes
//   0 u8 identity | 1 u8 time-slot number | 2 6 x u8 signal-to-interference ratio of a slot
PlistDictionary row(const LogPacket& channel)
{
    PlistArray ratios;
    for (std::size_t slot = 0; slot < slotCount; ++slot)
        ratios.append(decimal(channel.u8(2 + slot)));
    return {
        {"CCTRCH ID", decimal(channel.u8(0))}, {"TSNUM", decimal(channel.u8(1))}, {"SIR", ratios}};
}

} // namespace

std::string_view CCTRCHSIRMeasurement::getSectionName() const
{
    return "CCTRCH SIR";
}

std::vector<std::uint32_t> CCTRCHSIRMeasurement::getLogCodeArray() const
{
    return {TransportChannelRecord::logCode};
}

void CCTRCHSIRMeasurement::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("CCTRCH SIR Measurement");
    if (logCode != TransportChannelRecord::logCode ||
        packet.size() < TransportChannelRecord::minimumSize)
        return;
    clearRows();

    const RecordElements channels = TransportChannelRecord::compositeChannels(packet);
    PlistArray rows;
    for (std::size_t i = 0; i < channels.completeIn(packet); ++i)
        rows.append(row(channels.element(packet, i)));
    showRows(rows);
}

} // namespace ventrik
