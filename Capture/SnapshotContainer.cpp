#include "Capture/SnapshotContainer.h"

#include "PropertyList/PropertyListReader.h"
#include "PropertyList/PropertyListWriter.h"

#include <algorithm>
#include <array>
#include <string_view>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::size_t blockSize = std::size_t{1} << 20;

bool isPropertyList(ByteView bytes)
{
    constexpr std::array<std::string_view, 3> beginnings{"<?xml", "<plist", "bplist00"};
    return std::ranges::any_of(beginnings, [&](std::string_view beginning) {
        return bytes.size() >= beginning.size() &&
               std::equal(beginning.begin(), beginning.end(), bytes.begin());
    });
}

// The bytes outlive the source.
std::unique_ptr<ByteSource> sourceOf(ByteView bytes)
{
    return std::make_unique<ByteSource>(
        [bytes](std::span<std::uint8_t> room, std::string&) mutable {
            const std::size_t count = std::min(room.size(), bytes.size());
            std::ranges::copy(bytes.first(count), room.begin());
            bytes = bytes.subspan(count);
            return count;
        });
}

bool isDateText(std::string_view text)
{
    constexpr std::string_view form = "0000-00-00 00:00:00 +0000";
    return std::ranges::equal(text, form, [](char character, char wanted) {
        if (wanted == '0')
            return character >= '0' && character <= '9';
        return character == wanted || (wanted == '+' && character == '-');
    });
}

// Year, month, day, time and offset from UTC, as a history entry tells them.
std::optional<Clock::TimePoint> timeOfDate(std::string_view text)
{
    if (!isDateText(text))
        return std::nullopt;
    const auto number = [&](std::size_t place, std::size_t width) {
        int value = 0;
        for (const char digit : text.substr(place, width))
            value = 10 * value + (digit - '0');
        return value;
    };
    using namespace std::chrono;
    const year_month_day day(year(number(0, 4)), month(static_cast<unsigned>(number(5, 2))),
                             std::chrono::day(static_cast<unsigned>(number(8, 2))));
    constexpr year firstYear{1970};
    constexpr year lastYear{2200};
    if (!day.ok() || day.year() < firstYear || day.year() > lastYear)
        return std::nullopt;
    const auto offset = hours(number(21, 2)) + minutes(number(23, 2));
    return sys_days(day) + hours(number(11, 2)) + minutes(number(14, 2)) + seconds(number(17, 2)) -
           (text[20] == '-' ? -offset : offset);
}

} // namespace

bool SnapshotContainer::isIn(ByteView firstBytes)
{
    return isPropertyList(firstBytes);
}

SnapshotContainer::SnapshotContainer(std::unique_ptr<ByteSource> source, std::string name)
    : _source(std::move(source)), _name(std::move(name)), _displayState("")
{
}

std::optional<CapturedMessage> SnapshotContainer::next()
{
    if (_source)
        readSnapshot();
    while (true) {
        if (auto message = nextPacket())
            return message;
        if (_nextEntry == _entries.size())
            return std::nullopt;
        if (auto message = beginEntry(_entries[_nextEntry++]))
            return message;
    }
}

void SnapshotContainer::readSnapshot()
{
    const auto file = readFile();
    _source.reset();
    if (!file)
        return;
    const auto reading = readPropertyList(*file);
    const PlistDictionary* snapshot = reading ? reading.value->dictionary() : nullptr;
    const PlistValue* data = snapshot ? snapshot->find("Data") : nullptr;
    if (!reading)
        _error = fmt::format("{}: {}", _name, reading.error);
    else if (!data || !data->array())
        _error = fmt::format("{}: no snapshot: it holds no array \"Data\"", _name);
    else
        _entries = *data->array();
}

std::optional<Bytes> SnapshotContainer::readFile()
{
    Bytes file;
    while (file.size() <= maximumSize) {
        const ByteView block = _source->peek(blockSize);
        if (block.empty())
            break;
        file.insert(file.end(), block.begin(), block.end());
        _source->skip(block.size());
    }
    _error = _source->error();
    if (file.size() > maximumSize)
        _error = fmt::format("{}: offset {}: a snapshot may hold {} MiB", _name, maximumSize,
                             maximumSize >> 20);
    return _error.empty() ? std::optional(std::move(file)) : std::nullopt;
}

std::optional<CapturedMessage> SnapshotContainer::nextPacket()
{
    const auto packet = _packets ? _packets->next() : std::nullopt;
    if (!packet)
        return std::nullopt;
    _time = packet->time.value_or(_time);
    return CapturedMessage{_time, packet->data};
}

// An entry without a period's packets is that of the log, which repeats them.
std::optional<CapturedMessage> SnapshotContainer::beginEntry(const PlistValue& entry)
{
    _packets.reset();
    const PlistDictionary* period = entry.dictionary();
    if (!period) {
        ++_unreadableEntries;
        return std::nullopt;
    }
    const PlistValue* date = period->find("Date");
    if (date && date->string())
        _time = timeOfDate(*date->string()).value_or(_time);
    const PlistValue* displayState = period->find("DisplayState");
    return displayState ? beginPeriod(*displayState) : std::nullopt;
}

// The cell monitor's message was kept as the value that it was, and becomes bytes again.
std::optional<CapturedMessage> SnapshotContainer::beginPeriod(const PlistValue& displayState)
{
    _displayState = displayState;
    if (!displayState.data()) {
        const auto message = propertyListBytes(displayState);
        _displayState = message.value_or(Bytes());
        _unreadableEntries += message ? 0 : 1;
    }
    const ByteView bytes = *_displayState.data();
    if (isPropertyList(bytes))
        return CapturedMessage{_time, bytes};
    _period = sourceOf(bytes);
    _packets.emplace(*_period, LogRecords::Framing::Typed, _damage, _packetBytes);
    _packetBytes += bytes.size();
    return std::nullopt;
}

std::vector<std::string> SnapshotContainer::notes() const
{
    std::vector<std::string> lines;
    _damage.tell(lines, _name);
    if (_unreadableEntries > 0)
        lines.push_back(fmt::format("{}: entries of the history that cannot be read: {}", _name,
                                    _unreadableEntries));
    return lines;
}

} // namespace ventrik
