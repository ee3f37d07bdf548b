#include "Capture/LogRecords.h"

#include "Capture/CaptureContainer.h"
#include "Packets/LogPacket.h"
#include "Packets/SharedRecords.h"
#include "PropertyList/PropertyListReader.h"

#include <algorithm>
#include <array>
#include <span>
#include <string_view>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

// Record, little-endian: 0 u16 length | 2 u16 log code | 4 8 bytes timestamp | 12 payload
constexpr std::size_t headSize = 12;
constexpr std::size_t codeOffset = 2;
constexpr std::size_t timestampOffset = 4;
constexpr std::size_t lengthModulus = 65536;

// What may stand before a record. Of a period's first packet one byte is gone, which leaves of a
// transport prefix its second byte.
constexpr std::size_t typeSize = 1;
constexpr std::size_t restOfPrefixSize = 2;
constexpr std::size_t prefixAndTypeSize = transportPrefixSize + typeSize;
constexpr std::array<std::size_t, 4> bareForms{0, typeSize, restOfPrefixSize, prefixAndTypeSize};
constexpr std::array<std::size_t, 3> soughtBareForms{0, typeSize, prefixAndTypeSize};
constexpr std::array<std::size_t, 2> typedForms{typeSize, prefixAndTypeSize};

constexpr int chainDepth = 4; // of records that are looked at to choose between forms
constexpr std::size_t windowSize = (chainDepth + 1) * (lengthModulus + prefixAndTypeSize);
constexpr std::size_t spareSize = std::size_t{256} << 10; // read ahead, beyond what is asked for
constexpr auto nearTime = std::chrono::days(3653);

std::span<const std::size_t> formsOf(LogRecords::Framing framing)
{
    if (framing == LogRecords::Framing::Typed)
        return typedForms;
    return bareForms;
}

std::span<const std::size_t> soughtFormsOf(LogRecords::Framing framing)
{
    if (framing == LogRecords::Framing::Typed)
        return typedForms;
    return soughtBareForms;
}

bool isNear(Clock::TimePoint time, std::optional<Clock::TimePoint> near)
{
    return !near || std::chrono::abs(time - *near) <= nearTime;
}

bool isPacketType(std::uint8_t type)
{
    return type == ordinaryPacketType || type == extraCodePacketType;
}

bool canStandBefore(ByteView bytes, std::size_t before)
{
    if (before == prefixAndTypeSize && bytes[0] != transportPrefixMark)
        return false;
    return before == 0 || bytes.size() < before || isPacketType(bytes[before - 1]);
}

bool startsWith(ByteView bytes, std::string_view text)
{
    return bytes.size() >= text.size() && std::equal(text.begin(), text.end(), bytes.begin());
}

} // namespace

bool LogRecords::isPlausibleAtStart(ByteView firstBytes, Framing framing)
{
    ByteSource source(Bytes(firstBytes.begin(), firstBytes.end()), firstBytes.size());
    RecordDamage damage;
    LogRecords records(source, framing, damage);
    records.load(windowSize);
    return records.isPlausibleAt(0, std::nullopt, 1);
}

std::optional<LogRecords::Packet> LogRecords::next()
{
    consume(std::exchange(_taken, 0));
    while (_error.empty()) {
        load(windowSize);
        if (_view.empty())
            break;
        const auto head = bestHead();
        if (head && head->isUnfinished) {
            endUnfinished();
            break;
        }
        const auto size = head ? sizeOf(*head) : std::nullopt;
        if (size && (*size <= _view.size() || _framing == Framing::Typed))
            return take(*head, std::min(*size, _view.size()));
        const std::uint64_t start = offset();
        if (size || !skipToPlausible(head.has_value()))
            endTruncated(start, "a record is not whole");
    }
    return std::nullopt;
}

void LogRecords::load(std::size_t size)
{
    if (_view.size() >= size || _isAtEnd)
        return;
    _view = _source.peek(size + spareSize);
    _isAtEnd = _view.size() < size + spareSize;
}

void LogRecords::consume(std::size_t size)
{
    _view = _view.subspan(size);
    _source.skip(size);
}

// A packet's type byte tells enough where packets follow each other as they should.
LogRecords::TimeRule LogRecords::rule() const
{
    return _framing == Framing::Typed ? TimeRule::Free : TimeRule::Needed;
}

std::optional<LogRecordHead> LogRecords::headAt(std::size_t position, std::size_t before, Time near,
                                                TimeRule timeRule) const
{
    const ByteView bytes = _view.subspan(position);
    if (bytes.empty() || !canStandBefore(bytes, before))
        return std::nullopt;
    if (bytes.size() < before + headSize)
        return LogRecordHead{.before = before, .isUnfinished = true};
    const LogPacket record(bytes.subspan(before));
    const std::size_t length = record.u16(0);
    const std::uint16_t code = record.u16(codeOffset);
    if (length < headSize || code == 0)
        return std::nullopt;
    const Time time = timeOfTimestamp(record.littleEndianWord(timestampOffset));
    // A version report tells no time.
    const bool isReport = code == SharedRecords::versionReport.logCode;
    if (timeRule == TimeRule::Needed && (!time || (!isReport && !isNear(*time, near))))
        return std::nullopt;
    return LogRecordHead{before, length, code, isReport ? std::nullopt : time};
}

// The next bytes may look like more than one form. The one that is followed by most records is it.
std::optional<LogRecordHead> LogRecords::bestHead() const
{
    std::optional<LogRecordHead> best;
    int longest = -1;
    for (const std::size_t before : formsOf(_framing)) {
        const auto head = headAt(0, before, _lastTime, rule());
        if (!head)
            continue;
        const int length = head->isUnfinished
                               ? 0
                               : chainAt(before + head->length, chainDepth - 1,
                                         head->time ? head->time : _lastTime, rule());
        if (length > longest) {
            longest = length;
            best = head;
        }
    }
    return best;
}

// How many records follow each other from there on; as many as are asked for where they end with
// the bytes.
int LogRecords::chainAt(std::size_t position, int depth, Time near, TimeRule timeRule) const
{
    if (position >= _view.size() || depth == 0)
        return position == _view.size() ? depth : 0;
    int longest = 0;
    for (const std::size_t before : formsOf(_framing)) {
        const auto head = headAt(position, before, near, timeRule);
        if (!head)
            continue;
        const int rest = head->isUnfinished ? 0
                                            : chainAt(position + before + head->length, depth - 1,
                                                      head->time ? head->time : near, timeRule);
        longest = std::max(longest, 1 + rest);
    }
    return longest;
}

bool LogRecords::fits(std::size_t end, const LogRecordHead& head, TimeRule timeRule) const
{
    return chainAt(end, 1, head.time ? head.time : _lastTime, timeRule) > 0;
}

bool LogRecords::isPlausibleAt(std::size_t position, Time near, int followers) const
{
    return std::ranges::any_of(soughtFormsOf(_framing), [&](std::size_t before) {
        const auto head = headAt(position, before, near, TimeRule::Needed);
        return head && !head->isUnfinished &&
               chainAt(position + before + head->length, followers, head->time ? head->time : near,
                       TimeRule::Needed) >= followers;
    });
}

// A clock may be set by more than the years that are plausible: several records that agree on a
// time are believed.
bool LogRecords::findsPlausibleAt(std::size_t position)
{
    if (isPlausibleAt(position, _lastTime, 1))
        return true;
    const bool isFar = isPlausibleAt(position, std::nullopt, chainDepth - 1);
    if (isFar)
        _lastTime.reset();
    return isFar;
}

// None when the length is wrong. Where it is right but nothing fits behind it, what is wrong begins
// there: a record that is whole is not lost to what follows it.
std::optional<std::size_t> LogRecords::sizeOf(const LogRecordHead& head)
{
    if (holdsPropertyList(head))
        return sizeOfPropertyList(head);
    const std::size_t end = head.before + head.length;
    if (fits(end, head, rule()) || !hasPlausibleWithin(end))
        return end;
    return std::nullopt;
}

// A property list may be longer than its record's length can say, by a multiple of what it counts
// to. Bytes that were looked through once in vain are not looked through again.
std::optional<std::size_t> LogRecords::sizeOfPropertyList(const LogRecordHead& head)
{
    const std::size_t limit = offset() < _lookedOnTo ? lengthModulus : propertyListMaximumSize;
    const std::size_t first = head.before + head.length;
    for (std::size_t end = first; end <= limit + first; end += lengthModulus) {
        load(end + windowSize);
        if (end > _view.size())
            break;
        if (fits(end, head, TimeRule::Needed))
            return end;
    }
    _lookedOnTo = std::max(_lookedOnTo, offset() + propertyListMaximumSize);
    return fits(first, head, rule()) ? std::optional(first) : std::nullopt;
}

bool LogRecords::holdsPropertyList(const LogRecordHead& head) const
{
    const ByteView payload = _view.subspan(head.before + headSize);
    return startsWith(payload, "<?xml") || startsWith(payload, "<plist") ||
           startsWith(payload, "bplist00");
}

bool LogRecords::hasPlausibleWithin(std::size_t end)
{
    for (std::size_t position = 1; position < std::min(end, _view.size()); ++position) {
        if (isPlausibleAt(position, _lastTime, 1))
            return true;
    }
    return false;
}

// A record that cannot be right is skipped with what follows it. False when it is the bytes' last
// and may merely be cut.
bool LogRecords::skipToPlausible(bool isRecord)
{
    const std::uint64_t start = offset();
    consume(isRecord ? 1 : 0);
    bool isFound = false;
    while (!isFound && !_view.empty()) {
        load(windowSize + spareSize);
        const std::size_t count = std::min(_view.size(), spareSize);
        std::size_t position = 0;
        while (position < count && !findsPlausibleAt(position))
            ++position;
        isFound = position < count;
        consume(position);
        load(1);
    }
    if (!isFound && isRecord && _framing == Framing::Bare)
        return false;
    if (offset() > start)
        _damage.addBytes(start, offset() - start);
    return true;
}

LogRecords::Packet LogRecords::take(const LogRecordHead& head, std::size_t size)
{
    const std::uint64_t start = offset();
    ByteView packet = _view.first(size);
    if (_framing == Framing::Typed) {
        if (size < head.before + head.length)
            _damage.addShort(start);
    } else if (head.before > 0) {
        _damage.addTyped(start);
        packet = packet.subspan(head.before - typeSize);
    } else {
        _packet.assign(1, ordinaryPacketType);
        _packet.insert(_packet.end(), packet.begin(), packet.end());
        packet = _packet;
    }
    // One that nothing fits behind may tell any time.
    if (head.time && fits(size, head, rule()))
        _lastTime = head.time;
    _taken = size;
    return {packet, head.code, head.time};
}

void LogRecords::endUnfinished()
{
    if (_framing == Framing::Bare)
        return endTruncated(offset(), "a record's head is not whole");
    _damage.addBytes(offset(), _view.size());
    consume(_view.size());
}

void LogRecords::endTruncated(std::uint64_t start, std::string_view what)
{
    _error = fmt::format("offset {}: truncated: {}", start, what);
}

} // namespace ventrik
