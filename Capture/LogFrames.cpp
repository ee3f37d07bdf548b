#include "Capture/LogFrames.h"

#include "Packets/LogPacket.h"

#include <fmt/format.h>

namespace ventrik
{

namespace
{

// Log frame, little-endian
//   0 u8 kind | 1 u8 records that wait | 2 u16 length | 4 u16 length again, of the record from
//   here on | 6 u16 log code | 8 8 bytes timestamp | 16 payload
constexpr std::uint8_t logKind = 0x10;
constexpr std::size_t recordOffset = 4;
constexpr std::size_t recordHeaderSize = 12;
// Frame of one of the phone's two subscriptions: 0 u8 kind | 4 u32 subscription | 8 another frame
constexpr std::uint8_t wrappingKind = 0x98;
constexpr std::size_t subscriptionOffset = 4;
constexpr std::size_t wrappedOffset = 8;
constexpr std::size_t timestampOffset = 5; // in a packet

} // namespace

std::optional<CapturedMessage> LogFrames::record(const HdlcFrame& frame)
{
    ByteView content = frame.content;
    std::optional<std::uint32_t> subscription;
    if (content[0] == wrappingKind) {
        if (content.size() <= wrappedOffset) {
            _badWrappings.add(frame.offset);
            return std::nullopt;
        }
        subscription = LogPacket(content).u32(subscriptionOffset);
        content = content.subspan(wrappedOffset);
    }
    if (content[0] != logKind) {
        ++_otherKinds.at(content[0]);
        return std::nullopt;
    }
    if (!takeRecord(content)) {
        _badRecords.add(frame.offset);
        return std::nullopt;
    }
    ++_recordCount;
    _time = timeOfTimestamp(LogPacket(_packet).littleEndianWord(timestampOffset)).value_or(_time);
    return CapturedMessage{_time, _packet, subscription};
}

// A record is a packet without its type.
bool LogFrames::takeRecord(ByteView content)
{
    const std::size_t length = LogPacket(content).u16(recordOffset);
    if (length < recordHeaderSize || content.size() < recordOffset + length)
        return false;
    const ByteView record = content.subspan(recordOffset, length);
    _packet.assign(1, ordinaryPacketType);
    _packet.insert(_packet.end(), record.begin(), record.end());
    return true;
}

void LogFrames::tell(std::vector<std::string>& notes, std::string_view name) const
{
    _badRecords.tell(notes, name, "log record", "of a wrong length");
    _badWrappings.tell(notes, name, "frame", "of a subscription without content");
    for (std::size_t kind = 0; kind < _otherKinds.size(); ++kind) {
        if (const auto count = _otherKinds.at(kind); count > 0)
            notes.push_back(fmt::format("{}: {} frame{} of kind 0x{:02X}", name, count,
                                        count == 1 ? "" : "s", kind));
    }
}

void LogFrames::addTo(PlistDictionary& report) const
{
    report.set("Log Records", fmt::format("{}", _recordCount));
    _badRecords.addTo(report, "Log Records of a Wrong Length");
    _badWrappings.addTo(report, "Subscriptions Without Content");
    for (std::size_t kind = 0; kind < _otherKinds.size(); ++kind) {
        if (const auto count = _otherKinds.at(kind); count > 0)
            report.set(fmt::format("Frames of Kind 0x{:02X}", kind), fmt::format("{}", count));
    }
}

} // namespace ventrik
