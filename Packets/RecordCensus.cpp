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
    if (counted == _kinds.end()) {
        const ByteView payload = LogPacket(stripPrefix(message)).payload();
        counted = _kinds.insert({*kind, {0, Bytes(payload.begin(), payload.end())}}).first;
    }
    ++counted->second.count;
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
    const auto layouts = mode == RecordsMode::Base ? std::span<const Layout>() : layoutsOf(code);
    const ChosenLayout chosen = chooseLayout(*base, layouts, packet);
    kind.version = versionOf(*chosen.record, packet);
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
