#include "Packets/RecordCensus.h"

#include "Packets/AllRecords.h"

namespace ventrik
{

namespace
{

bool isRecord(const LogPacket& packet)
{
    const std::uint8_t type = packet.u8(0);
    return packet.size() >= logPacketHeaderSize &&
           (type == ordinaryPacketType || type == extraCodePacketType);
}

ChosenLayout chooseLayoutOf(const Record& record, const LogPacket& packet, RecordsMode mode)
{
    return chooseLayout(
        record, mode == RecordsMode::Base ? std::span<const Layout>() : layoutsOf(record.logCode),
        packet);
}

} // namespace

void RecordCensus::take(ByteView message)
{
    const auto kind = recordKindOf(message, _mode);
    if (!kind) {
        ++_brokenCount;
        return;
    }
    auto counted = _kinds.find(*kind);
    if (counted == _kinds.end() && _kinds.size() >= maximumKinds) {
        ++_otherCount;
        return;
    }
    if (counted == _kinds.end())
        ++add(*kind, LogPacket(stripPrefix(message))).count;
    else
        ++counted->second.count;
}

RecordCensus::Counted& RecordCensus::add(const Kind& kind, const LogPacket& packet)
{
    Counted& counted = _kinds[kind];
    if (const Record* record = recordOf(kind.logCode))
        counted.isTooShort =
            packet.size() < chooseLayoutOf(*record, packet, _mode).record->minimumSize;
    const ByteView payload = packet.payload();
    if (_payloads == Payloads::Kept && _payloadBytes + payload.size() <= maximumPayloads) {
        counted.firstPayload.assign(payload.begin(), payload.end());
        _payloadBytes += payload.size();
    }
    return counted;
}

std::optional<RecordKind> recordKindOf(ByteView message, RecordsMode mode)
{
    const LogPacket packet(stripPrefix(message));
    if (!isRecord(packet))
        return std::nullopt;
    const std::uint32_t code = effectiveLogCode(packet);
    RecordKind kind{code, std::nullopt, packet.size(), std::nullopt};
    const Record* base = recordOf(code);
    if (!base)
        return kind;
    const ChosenLayout chosen = chooseLayoutOf(*base, packet, mode);
    kind.version = chosen.version;
    if (!base->isExtension || mode == RecordsMode::Extended)
        kind.layout = chosen.kind;
    return kind;
}

bool isExtensionOnly(const LogPacket& packet)
{
    if (!isRecord(packet))
        return false;
    const Record* record = recordOf(effectiveLogCode(packet));
    return record && record->isExtension &&
           chooseLayout(*record, layoutsOf(record->logCode), packet).kind != LayoutKind::NotKnown;
}

} // namespace ventrik
