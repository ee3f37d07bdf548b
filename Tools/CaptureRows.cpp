#include "Tools/CaptureRows.h"

#include <algorithm>
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
constexpr unsigned knownValueShift = 64 - knownValueBits;

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

void CaptureRows::append(const RecordPart& recordPart, std::string_view placePart,
                         std::string_view valuePart)
{
    const std::size_t size = _used + recordPart.front.size() + placePart.size() + valuePart.size() +
                             recordPart.back.size();
    if (size > _text.size())
        _text.resize(std::max(2 * size, firstRoom));
    char* end = _text.data() + _used;
    for (const std::string_view part : {recordPart.front, placePart, valuePart, recordPart.back})
        end = std::copy_n(part.data(), part.size(), end);
    _used = size;
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
    const RowRecord none{_closing.records, message.time, message.subscription, {}};
    RowRecord record = none;
    record.kind = kindOf(message);
    if (!std::exchange(_hasDisplay, true)) {
        // It also shows what no record told.
        for (const DisplayChange& change : changes)
            writeRow(_writer->recordPart(_changes.cellAt(*change.place, state) ? record : none),
                     change, state);
        return;
    }
    const RecordPart part = _writer->recordPart(record);
    for (const DisplayChange& change : changes)
        writeRow(part, change, state);
}

void CaptureRows::writeState(Clock::TimePoint time, const PlistDictionary& state)
{
    _changes.take(state);
    const RecordPart part =
        _writer->recordPart({_closing.records == 0 ? 0 : _closing.records - 1, time, {}, {}});
    for (const DisplayPlace* place : _changes.values())
        writeRow(part, {DisplayChange::Kind::Shown, place}, state);
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

// Values come again and again.
std::string_view CaptureRows::valuePart(const std::optional<ShownCell>& cell, std::string_view text)
{
    const Field* field = cell ? cell->field : nullptr;
    const auto number = static_cast<std::uint64_t>(
        cell ? cell->raw : static_cast<std::int64_t>(std::hash<std::string_view>{}(text)));
    const std::uint64_t hash =
        (std::hash<const Field*>{}(field) + number) * 0x9E3779B97F4A7C15U; // spreads neighbors
    KnownValue& known = _values[hash >> knownValueShift];
    if (known.field == field && known.raw == number && known.text == text && !known.part.empty() &&
        known.workedOut == (cell ? cell->workedOut : std::nullopt))
        return known.part;
    known.field = field;
    known.raw = number;
    known.workedOut = cell ? cell->workedOut : std::nullopt;
    known.text = text;
    known.part.clear();
    _writer->addValue(known.part, cell ? RowValue{cell->number(), field->shown.unit, text}
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

const CaptureRows::KnownPlace& CaptureRows::knownPlace(const DisplayPlace& place,
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
