#include "LogGenerator/Orbel/UTRAN/CCTRCHSIRMeasurement.h"

#include "Packets/UTRANRecords.h"

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
        rows.showTexts(fields.back(), numberOf(channel, fields.back()), UTRANRecords::slotRatio);
    }
}

} // namespace ventrik
