#include "LogGenerator/Orbel/UTRAN/CCTRCHSIRMeasurement.h"

#include "Packets/UTRANRecords.h"

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr SectionTable table{
    .name = "CCTRCH SIR",
    .trace = "CCTRCH SIR Measurement",
    .records = {{{.record = &UTRANRecords::transportChannelMeasurement}}},
    .unknownCode = UnknownCode::Ignored,
};

PlistArray slotRatios(std::int64_t bytes)
{
    PlistArray ratios;
    for (std::size_t slot = 0; slot < UTRANRecords::slotCount; ++slot)
        ratios.append(fmt::format("{}", bytes >> (8 * slot) & 0xFF));
    return ratios;
}

} // namespace

CCTRCHSIRMeasurement::CCTRCHSIRMeasurement(SystemLog& log) : Base(log, table) {}

void CCTRCHSIRMeasurement::decode(const ShownRecord& shown, const LogPacket& packet)
{
    const auto fields = std::span(UTRANRecords::compositeChannelFields);
    RowList::Rewrite rows = rewriteRows(*shown.record);
    const RecordElements channels = UTRANRecords::compositeChannels.elementsOf(packet);
    for (std::size_t i = 0; i < channels.completeIn(packet); ++i) {
        const LogPacket channel = channels.element(packet, i);
        rows.nextRow(channels.offset + channels.stride * i);
        rows.show(fields.first(2), channel);
        rows.show(fields.back(), numberOf(channel, fields.back()), slotRatios);
    }
}

} // namespace ventrik
