#include "LogGenerator/Orbel/LTE/ServingCellSignal.h"

#include "Packets/LTESignalRecords.h"

#include <algorithm>

namespace ventrik
{

namespace
{

using namespace LTESignalRecords;

constexpr SectionTable servingCellSignalTable{
    .name = "Serving Cell Signal",
    .records = {{{.record = &servingCellSignal}}},
};
constexpr SectionTable signalByCellTable{
    .name = "Signal by Cell",
    .records = {{{.record = &servingCellSignal}}},
};

/// A cell of a subpacket.
struct SignalCell {
    LogPacket bytes;
    std::size_t start; ///< in the packet
    const PlacedSubpacket& subpacket;
    const SignalVersion& version;
    const SignalFields& fields;

    bool isAlone() const { return version.servingBit == 0; }
    bool isServing() const { return isAlone() || numberOf(bytes, fields.serving) != 0; }
    std::int64_t carrier() const { return isAlone() ? 0 : numberOf(bytes, fields.carrier); }
    std::int64_t earfcn() const { return numberOf(subpacket.bytes, fields.earfcn()); }
    bool hasMeasured(std::size_t antenna) const;
};

bool SignalCell::hasMeasured(std::size_t antenna) const
{
    const auto isSet = [&](std::int64_t mask) { return (mask >> antenna & 1) != 0; };
    switch (version.measured) {
    case MeasuredAntennas::All:
        break;
    case MeasuredAntennas::WithRSRP:
        return numberOf(bytes, fields.antenna(antenna).front()) != 0;
    case MeasuredAntennas::OfHeaderMask:
        return isSet(numberAt(subpacket.bytes, headerMask));
    case MeasuredAntennas::OfCellMask:
        return isSet(numberAt(bytes, cellMask));
    }
    return true;
}

RecordElements cellsOf(const SignalVersion& version, const SignalFields& fields,
                       const LogPacket& subpacket)
{
    const std::size_t offset = Subpackets::headSize + version.headerSize;
    if (version.stride == absent)
        return {offset, fields.needed, 1, fields.needed};
    const auto count = static_cast<std::size_t>(numberAt(subpacket, signalCellCount));
    if (version.stride > 0)
        return {offset, version.stride, count, fields.needed};
    const std::size_t room = subpacket.size() > offset ? subpacket.size() - offset : 0;
    const std::size_t stride = count > 0 ? room / count : 0;
    return {offset, std::max(stride, fields.needed), stride < fields.needed ? 0 : count,
            fields.needed};
}

/// Hands each cell of the packet to `use`.
template <typename Use>
void forEachCell(const LogPacket& packet, const Use& use)
{
    for (const PlacedSubpacket& subpacket : subpacketsOf(packet, *servingCellSignal.subpacket)) {
        const auto version =
            std::ranges::find(signalVersions, subpacket.version, &SignalVersion::version);
        if (version == signalVersions.end())
            continue;
        const SignalFields& fields = signalFieldsOf(*version);
        const RecordElements cells = cellsOf(*version, fields, subpacket.bytes);
        for (std::size_t i = 0; i < cells.completeIn(subpacket.bytes); ++i)
            use(SignalCell{cells.element(subpacket.bytes, i),
                           subpacket.start + cells.offset + cells.stride * i, subpacket, *version,
                           fields});
    }
}

} // namespace

ServingCellSignal::ServingCellSignal(SystemLog& log) : Base(log, servingCellSignalTable) {}

void ServingCellSignal::decode(const ShownRecord&, const LogPacket& packet)
{
    forEachCell(packet, [&](const SignalCell& cell) {
        if (!cell.isServing() || cell.carrier() != 0)
            return;
        const auto showAll = [&](std::span<const Field> fields) {
            for (const Field& field : fields)
                show(field, numberOf(cell.bytes, field), cell.start);
        };
        show(cell.fields.earfcn(), cell.earfcn(), cell.subpacket.start);
        showAll(cell.fields.cell());
        for (std::size_t i = 0; i < cell.version.order->antennaCount; ++i)
            if (cell.hasMeasured(i))
                showAll(cell.fields.antenna(i));
    });
}

SignalByCell::SignalByCell(SystemLog& log) : Base(log, signalByCellTable) {}

void SignalByCell::decode(const ShownRecord& shown, const LogPacket& packet)
{
    RowList::Rewrite rows = rewriteRows(*shown.record);
    forEachCell(packet, [&](const SignalCell& cell) {
        rows.nextRow(cell.start);
        rows.showWorkedOut(cell.fields.earfcn(), cell.earfcn()); // it stands in front of the cells
        rows.show(cell.fields.cell(), cell.bytes);
        for (std::size_t i = 0; i < cell.version.order->antennaCount; ++i)
            if (cell.hasMeasured(i))
                rows.show(cell.fields.antenna(i), cell.bytes);
        if (cell.isAlone()) {
            rows.showValue("Carrier Index", "0");
            rows.showValue("Serving", "True");
        } else {
            rows.show(cell.fields.carrier, cell.carrier());
            rows.show(cell.fields.serving, cell.isServing() ? 1 : 0);
        }
    });
}

} // namespace ventrik
