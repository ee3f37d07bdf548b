#include "Model/ValueSource.h"

#include "LogGenerator/Core/AssertionFailure.h"
#include "LogGenerator/Core/DateText.h"
#include "Model/CodeReport.h"
#include "Platform/Technology.h"

#include <algorithm>
#include <chrono>
#include <utility>

#include <fmt/chrono.h>
#include <fmt/format.h>
#include <fmt/ranges.h>

namespace ventrik
{

namespace
{

std::string timeText(Clock::TimePoint time, const Clock& clock)
{
    const auto local = time + std::chrono::seconds(clock.timeZone(time).secondsFromUtc);
    const auto seconds = std::chrono::floor<std::chrono::seconds>(local);
    const auto milliseconds =
        std::chrono::duration_cast<std::chrono::milliseconds>(local - seconds).count();
    return fmt::format("{:%Y-%m-%d %H:%M:%S}.{:03}", seconds, milliseconds);
}

std::string rawText(std::int64_t raw)
{
    return raw < 0 ? fmt::format("{} (-0x{:X})", raw, -raw) : fmt::format("{} (0x{:X})", raw, raw);
}

std::string placeText(const ValueSource::Bits& bits)
{
    const std::size_t count = bits.place.bytes();
    std::string place =
        count == 1 ? fmt::format("byte {}", bits.firstByte)
                   : fmt::format("bytes {} to {}", bits.firstByte, bits.firstByte + count - 1);
    if (bits.place.bit != 0 || bits.place.width != 8 * count)
        place += bits.place.width == 1 ? fmt::format(", bit {}", bits.place.bit)
                                       : fmt::format(", bits {} to {}", bits.place.bit,
                                                     bits.place.bit + bits.place.width - 1);
    if (count > 1)
        place += bits.place.isBigEndian ? ", big-endian" : ", little-endian";
    if (bits.place.isSigned)
        place += ", signed";
    return place;
}

} // namespace

/// A log for decoding that nobody is to hear of.
class ValueSources::Silence : public SystemLog
{
  public:
    Silence() : SystemLog(LogPriority::emergency) {}
    void showOnConsole(std::string_view) override {}

  protected:
    void write(int, std::string_view) override {}
};

std::vector<std::pair<std::string, std::string>> ValueSource::lines(const Clock& clock) const
{
    std::vector<std::pair<std::string, std::string>> lines{{"Value", text}, {"Path", path}};
    if (record) {
        lines.emplace_back("Log Code", recordName.empty()
                                           ? codeText(record->logCode)
                                           : codeText(record->logCode) + " " + recordName);
        if (record->version)
            lines.emplace_back("Version", fmt::format("{}", *record->version));
        if (record->layout)
            lines.emplace_back("Layout", nameOf(*record->layout));
    }
    lines.emplace_back("Shown Since", timeText(changed, clock));
    lines.emplace_back("Told Last", timeText(written, clock));
    if (raw)
        lines.emplace_back("Raw Number", rawText(*raw));
    if (bits)
        lines.emplace_back("Place", placeText(*bits));
    lines.emplace_back("Packet", packet.empty() ? std::string("not kept any more")
                                                : fmt::format("{} bytes", packet.size()));
    return lines;
}

std::string ValueSource::brief() const
{
    std::vector<std::string> parts;
    if (record) {
        parts.push_back(codeText(record->logCode));
        if (!recordName.empty())
            parts.back() += " " + recordName;
        if (record->version)
            parts.push_back(fmt::format("version {}", *record->version));
        if (record->layout)
            parts.push_back(fmt::format("layout {}", nameOf(*record->layout)));
    }
    if (raw)
        parts.push_back("raw " + rawText(*raw));
    if (bits)
        parts.push_back(placeText(*bits));
    return fmt::format("{}", fmt::join(parts, ", "));
}

bool ValueSource::isMarked(std::size_t byte) const
{
    return bits && byte >= bits->firstByte && byte < bits->firstByte + bits->place.bytes();
}

std::string ValueSource::packetText(std::size_t bytesOfLine) const
{
    std::string lines;
    for (std::size_t line = 0; line < packet.size(); line += bytesOfLine) {
        const std::size_t end = std::min(packet.size(), line + bytesOfLine);
        lines += fmt::format("{:04X} ", line);
        bool isOpen = false;
        for (std::size_t byte = line; byte < end; ++byte) {
            const bool wasOpen = std::exchange(isOpen, isMarked(byte));
            lines += isOpen == wasOpen ? ' ' : isOpen ? '[' : ']';
            lines += fmt::format("{:02X}", packet[byte]);
        }
        lines += isOpen ? "]\n" : "\n";
    }
    return lines;
}

std::string ValueSource::allText(const Clock& clock, std::size_t bytesOfLine) const
{
    std::string all;
    for (const auto& [name, value] : lines(clock))
        all += name + ": " + value + "\n";
    return all + "\n" + packetText(bytesOfLine);
}

ValueSources::ValueSources(const Resources& resources, const Clock& clock, RecordsMode records)
    : _resources(resources), _clock(clock), _records(records), _log(std::make_unique<Silence>())
{
}

ValueSources::~ValueSources() = default;

std::optional<ValueSource> ValueSources::find(const DisplayMoment& display,
                                              const ChangeStore& store,
                                              const std::string& path) const
{
    const DisplayMoment::Value* value = display.valueAt(path);
    if (!value)
        return std::nullopt;
    ValueSource source{path, std::string(value->shown.text), value->changed, value->written};
    const ByteView message = store.messageOf(value->change);
    const ByteView packet = value->logCode == 0 ? message : stripPrefix(message);
    source.packet.assign(packet.begin(), packet.end());
    if (value->logCode != 0) {
        source.record = recordKindOf(message, _records);
        if (!source.record)
            source.record = RecordKind{value->logCode, {}, 0, {}};
        source.recordName = nameOfCode(value->logCode);
    }
    if (value->shown.field) {
        source.raw = value->shown.raw;
        source.unit = value->shown.field->shown.unit;
        locate(source, value->shown, display.keysAt(path), display.technology());
    }
    return source;
}

// By a generator that has seen no other packet. What this one did not tell is not taken for it:
// field and number are those of the value.
void ValueSources::locate(ValueSource& source, const StoredValue& value,
                          const std::vector<std::string_view>& keys,
                          const std::string& technology) const
{
    const auto generator = source.packet.empty() ? nullptr : generatorOf(technology);
    if (!generator)
        return;
    PlistDictionary state;
    try {
        generator->updateState(state, source.packet);
    } catch (const AssertionFailure&) {
        return;
    }
    const auto origin = generator->originOf(state, keys);
    if (!origin || origin->field != value.field || origin->raw != value.raw ||
        origin->firstByte() + origin->field->place.bytes() > source.packet.size())
        return;
    source.bits = {origin->firstByte(), origin->field->place};
    if (origin->version && source.record)
        source.record->version = origin->version;
}

std::unique_ptr<LogGenerator> ValueSources::generatorOf(const std::string& technology) const
{
    const auto known = technologyNamed(technology);
    if (!known)
        return nullptr;
    return LogGenerator::generatorFromTechnology(
        known->identifier,
        {*_log, _resources, _clock, AssertionPolicy::Throw, _records, RawPackets::Dropped});
}

} // namespace ventrik
