#include "App/StoredRows.h"

#include "Capture/RowWriter.h"

#include <memory>
#include <optional>
#include <vector>

namespace ventrik
{

namespace
{

constexpr std::size_t blockSize = std::size_t{64} << 10;
constexpr RowFormat format = RowFormat::Csv;

/// Writes a row for each change that it is told.
class RowsOfChanges : public StoreVisitor
{
  public:
    RowsOfChanges(const ChangeStore& store, const std::string& capture,
                  const StoredRowsRange& range,
                  const std::function<void(std::string_view block)>& take)
        : _store(store),
          _capture(capture),
          _range(range),
          _take(take),
          _text(rowHeading(format)),
          _placeParts(store.places().size())
    {
    }

    void changed(const StoredChange& change) override;
    void flush();

  private:
    void useTechnologyOf(const StoredChange& change);
    void useRecordOf(const StoredChange& change);
    std::optional<RecordKind> kindOf(const StoredChange& change) const;
    std::string placePart(const StoredChange& change) const;
    void addValue(const StoredChange& change);

    const ChangeStore& _store;
    const std::string& _capture;
    const StoredRowsRange& _range;
    const std::function<void(std::string_view)>& _take;
    std::string _text;
    std::vector<std::string> _placeParts; // of values, by place
    std::string _technology;
    std::unique_ptr<RowWriter> _writer; // of that technology
    // Of the record that the last row told of.
    std::optional<std::uint64_t> _record;
    std::uint32_t _logCode = 0;
    RecordPart _recordPart;
};

void RowsOfChanges::changed(const StoredChange& change)
{
    if (change.time < _range.first || change.time > _range.last)
        return;
    if (_record != change.record || _logCode != change.logCode)
        useRecordOf(change);
    _text += _recordPart.front;
    if (change.kind == DisplayChange::Kind::Shown) {
        std::string& part = _placeParts[change.place];
        if (part.empty())
            part = placePart(change);
        _text += part;
    } else {
        _text += placePart(change);
    }
    addValue(change);
    _text += _recordPart.back;
    if (_text.size() >= blockSize)
        flush();
}

void RowsOfChanges::flush()
{
    _take(_text);
    _text.clear();
}

void RowsOfChanges::useTechnologyOf(const StoredChange& change)
{
    const std::string_view technology = _store.technologyAt(change.number + 1);
    if (_writer && technology == _technology)
        return;
    _technology = technology;
    _writer = RowWriter::create(format, _capture, technology);
}

void RowsOfChanges::useRecordOf(const StoredChange& change)
{
    useTechnologyOf(change);
    _record = change.record;
    _logCode = change.logCode;
    _recordPart = _writer->recordPart({.number = static_cast<std::size_t>(change.record),
                                       .time = change.time,
                                       .kind = kindOf(change)});
}

// Of what no record told there is none.
std::optional<RecordKind> RowsOfChanges::kindOf(const StoredChange& change) const
{
    if (change.logCode == 0)
        return std::nullopt;
    if (const ByteView message = _store.messageOf(change.number); !message.empty())
        return recordKindOf(message, _store.records());
    return RecordKind{change.logCode, std::nullopt, 0, std::nullopt};
}

// A group's path ends with a slash where it came empty, and not where it went.
std::string RowsOfChanges::placePart(const StoredChange& change) const
{
    const PlaceTable& places = _store.places();
    std::string path = places.pathOf(change.place);
    if (change.kind == DisplayChange::Kind::Empty)
        path += '/';
    return _writer->placePart({places[change.place].section, path, places.indexOf(change.place),
                               places.nameOf(change.place)});
}

void RowsOfChanges::addValue(const StoredChange& change)
{
    const StoredValue& value = change.value;
    if (change.kind == DisplayChange::Kind::Gone)
        _writer->addValue(_text, {});
    else if (change.kind == DisplayChange::Kind::Empty)
        _writer->addValue(_text, {.text = std::string_view()});
    else if (value.field)
        _writer->addValue(_text, {value.number, value.unit, value.text});
    else // a text that came as it is
        _writer->addValue(_text, {plainNumber(value.text), {}, value.text});
}

} // namespace

void StoredRows::write(const StoredRowsRange& range,
                       const std::function<void(std::string_view block)>& take) const
{
    RowsOfChanges rows(_store, _capture, range, take);
    _store.visit(_store.firstMoment(), rows);
    rows.flush();
}

} // namespace ventrik
