#include "Tools/CaptureRows.h"

#include <algorithm>
#include <cstring>
#include <functional>
#include <utility>

namespace ventrik
{

namespace
{

// A display of more places than that is none that a person looks at; what it costs is its service's
// affair, what it takes is not.
constexpr std::size_t maximumKnownPlaces = 65536;
constexpr std::size_t firstRoom = 4096;
constexpr unsigned knownValueBits = 13;

// Fields lie side by side and their numbers are small: each is spread by itself, so that the sums
// of no two of them meet.
std::size_t placeOf(const ShownCell& shown)
{
    constexpr std::uint64_t spreadsFields = 0x9E3779B97F4A7C15U;
    constexpr std::uint64_t spreadsNumbers = 0xC2B2AE3D27D4EB4FU;
    return (std::hash<const Field*>{}(shown.field) * spreadsFields +
            static_cast<std::uint64_t>(shown.raw) * spreadsNumbers) >>
           (64 - knownValueBits);
}

// Most texts are short: their bytes are number enough.
std::int64_t hashOf(std::string_view text)
{
    std::int64_t number = 0;
    if (text.size() > sizeof(number))
        return static_cast<std::int64_t>(std::hash<std::string_view>{}(text));
    std::memcpy(&number, text.data(), text.size());
    return number;
}

} // namespace

CaptureRows::CaptureRows(const RowOptions& options, std::string_view capture,
                         const Technology& technology, const LogGenerator& generator,
                         RecordsMode records)
    : _options(options),
      _records(records),
      _generator(generator),
      _changes(generator),
      _writer(RowWriter::create(options.format, capture, technology.name)),
      _wanted(generator.getStartCommand())
{
    _values.resize(std::size_t{1} << knownValueBits);
}

// Every row goes this way; the compiler makes one function of it.

inline void CaptureRows::append(const RecordPart& recordPart, std::string_view placePart,
                                std::string_view valuePart)
{
    const std::size_t size = _used + recordPart.front.size() + placePart.size() + valuePart.size() +
                             recordPart.back.size();
    if (size > _text.size())
        _text.resize(std::max(2 * size, firstRoom));
    char* end = _text.data() + _used;
    end = std::copy_n(recordPart.front.data(), recordPart.front.size(), end);
    end = std::copy_n(placePart.data(), placePart.size(), end);
    end = std::copy_n(valuePart.data(), valuePart.size(), end);
    std::copy_n(recordPart.back.data(), recordPart.back.size(), end);
    _used = size;
}

inline const CaptureRows::KnownPlace& CaptureRows::knownPlace(const DisplayPlace& place,
                                                              const PlistDictionary& state)
{
    const bool isKept = place.number < maximumKnownPlaces;
    if (isKept && place.number >= _places.size())
        _places.resize(place.number + 1);
    KnownPlace& known = isKept ? _places[place.number] : _otherPlace;
    if (known.serial != place.serial)
        describe(known, place, state);
    return known;
}

// Values come again and again. Two that lead to one place stand side by side.
inline std::string_view CaptureRows::valuePart(const std::optional<ShownCell>& cell,
                                               std::string_view text)
{
    const ShownCell shown = cell ? *cell : ShownCell{nullptr, hashOf(text)};
    const std::size_t place = placeOf(shown);
    KnownValue& first = _values[place];
    if (first.isOf(shown, text))
        return first.part;
    KnownValue& second = _values[place ^ 1];
    if (second.isOf(shown, text))
        return second.part;
    return keepValue(first.part.empty() ? first : second, shown, text);
}

void CaptureRows::writeRow(const RecordPart& recordPart, const DisplayChange& change,
                           const PlistDictionary& state)
{
    if (change.kind != DisplayChange::Kind::Shown)
        return writeHolder(recordPart, change, state);
    const KnownPlace& known = knownPlace(*change.place, state);
    if (!known.isSelected)
        return;
    const std::string_view value =
        valuePart(_changes.cellAt(*change.place, state), change.place->text);
    append(recordPart, known.part, value);
    ++_closing.rows;
}

void CaptureRows::runStepsBefore(Clock::TimePoint time, const PlistDictionary& state)
{
    if (!_options.every)
        return;
    const std::chrono::nanoseconds step = *_options.every;
    if (!_nextStep || time < _lastTime - step) {
        // Times that run back begin anew, after what stood until then.
        if (std::exchange(_isUpdated, false))
            writeState(*_nextStep, state);
        _nextStep = time + step;
    } else if (*_nextStep < time) {
        if (std::exchange(_isUpdated, false))
            writeState(*_nextStep, state);
        // Steps in which nothing came are passed over.
        *_nextStep += (time - *_nextStep + step - std::chrono::nanoseconds(1)) / step * step;
    }
    _lastTime = time;
}

void CaptureRows::take(const CapturedMessage& message, const PlistDictionary& state)
{
    _closing.bytes += message.data.size();
    if (_generator.lastRead() || _wanted.wants(message.data))
        ++_closing.decoded;
    if (_options.every)
        _isUpdated = true;
    else
        writeChanges(message, state);
    ++_closing.records;
}

void CaptureRows::finish(const PlistDictionary& state)
{
    if (std::exchange(_isUpdated, false))
        writeState(*_nextStep, state);
}

void CaptureRows::close(const RowClosing& closing)
{
    std::string row;
    _writer->appendClosing(row, closing);
    append({}, {}, row);
}

// The generator knows it as a rule.
std::optional<RecordKind> CaptureRows::kindOf(const CapturedMessage& message) const
{
    if (const ReadLayout* read = _generator.lastRead())
        return RecordKind{read->logCode, read->version, read->size, read->kind};
    return _wanted.wantsAll() ? std::nullopt : recordKindOf(message.data, _records);
}

void CaptureRows::writeChanges(const CapturedMessage& message, const PlistDictionary& state)
{
    const auto changes = _changes.take(state);
    if (changes.empty())
        return;
    const RowRecord record{_closing.records, message.time, message.subscription, kindOf(message)};
    if (!std::exchange(_hasDisplay, true))
        return writeFirst(record, changes, state);
    const RecordPart part = _writer->recordPart(record);
    for (const DisplayChange& change : changes)
        writeRow(part, change, state);
}

// The first display also shows what no record told.
void CaptureRows::writeFirst(const RowRecord& record, std::span<const DisplayChange> changes,
                             const PlistDictionary& state)
{
    RowRecord none = record;
    none.kind.reset();
    for (const DisplayChange& change : changes)
        writeRow(_writer->recordPart(_changes.cellAt(*change.place, state) ? record : none), change,
                 state);
}

void CaptureRows::writeState(Clock::TimePoint time, const PlistDictionary& state)
{
    _changes.take(state);
    const RecordPart part =
        _writer->recordPart({_closing.records == 0 ? 0 : _closing.records - 1, time, {}, {}});
    for (const DisplayPlace* place : _changes.values())
        writeRow(part, {DisplayChange::Kind::Shown, place}, state);
}

std::string_view CaptureRows::keepValue(KnownValue& known, const ShownCell& shown,
                                        std::string_view text) const
{
    known.field = shown.field;
    known.raw = shown.raw;
    known.isWorkedOut = shown.workedOut.has_value();
    known.text = text;
    known.part.clear();
    _writer->addValue(known.part, shown.field
                                      ? RowValue{shown.number(), shown.field->shown.unit, text}
                                      : RowValue{plainNumber(text), {}, text});
    return known.part;
}

// What goes takes with it what is below.
void CaptureRows::writeHolder(const RecordPart& recordPart, const DisplayChange& change,
                              const PlistDictionary& state)
{
    const bool isGone = change.kind == DisplayChange::Kind::Gone;
    const DisplayPlaceDescription description = _changes.describe(*change.place, state);
    if (isGone ? !_options.selection.reaches(description.path)
               : !_options.selection.selects(description.path))
        return;
    const std::string path = isGone ? description.path : description.path + "/";
    const std::string part =
        _writer->placePart({description.section, path, description.index, description.name});
    std::string value;
    _writer->addValue(value, isGone ? RowValue{} : RowValue{.text = std::string_view()});
    append(recordPart, part, value);
    ++_closing.rows;
}

void CaptureRows::describe(KnownPlace& known, const DisplayPlace& place,
                           const PlistDictionary& state) const
{
    const DisplayPlaceDescription description = _changes.describe(place, state);
    known.serial = place.serial;
    known.isSelected = _options.selection.selects(description.path);
    if (known.isSelected)
        known.part = _writer->placePart(
            {description.section, description.path, description.index, description.name});
}

} // namespace ventrik
