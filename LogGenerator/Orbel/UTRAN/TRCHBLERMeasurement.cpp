#include "LogGenerator/Orbel/UTRAN/TRCHBLERMeasurement.h"

#include "LogGenerator/Orbel/UTRAN/TransportChannelRecord.h"
#include "LogGenerator/Orbel/ValueText.h"

namespace ventrik
{

namespace
{

// Transport channel, 2 bytes
//   0 u8 identity | 1 u8 block error rate
PlistDictionary row(const LogPacket& channel)
{
    return {{"TRCH ID", decimal(channel.u8(0))}, {"TRCH BLER Measurement", decimal(channel.u8(1))}};
}

} // namespace

std::string_view TRCHBLERMeasurement::getSectionName() const
{
    return "TRCH BLER";
}

std::vector<std::uint32_t> TRCHBLERMeasurement::getLogCodeArray() const
{
    return {TransportChannelRecord::logCode};
}

void TRCHBLERMeasurement::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().log(LogPriority::notice, "TRCH BLER Measurement");
    if (logCode != TransportChannelRecord::logCode ||
        packet.size() < TransportChannelRecord::minimumSize)
        return;
    clearRows();

    const RecordElements channels = TransportChannelRecord::transportChannels(packet);
    PlistArray rows;
    for (std::size_t i = 0; i < channels.completeIn(packet); ++i)
        rows.append(row(channels.element(packet, i)));
    showRows(rows);
}

} // namespace ventrik
