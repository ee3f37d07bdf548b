#include "Tools/LiveRows.h"

#include "Platform/Technology.h"

#include <utility>

namespace ventrik
{

namespace
{

constexpr std::string_view captureName = "live";

} // namespace

LiveRows::LiveRows(RowOptions options, RecordsMode records)
    : _options(std::move(options)), _records(records), _text(rowHeading(_options.format))
{
}

void LiveRows::useGenerator(const LogGenerator* generator, std::string_view technology)
{
    endRows();
    const auto known = technologyNamed(technology);
    if (generator && known)
        _rows.emplace(_options, captureName, *known, *generator, _records).continueFrom(_closing);
}

void LiveRows::messageTaken(Clock::TimePoint time, ByteView message, const PlistDictionary& state)
{
    if (!_rows)
        return;
    _rows->runStepsBefore(time, state);
    _rows->take({time, message}, state);
    _closing = _rows->closing();
    _closing.status = "ok";
}

std::string LiveRows::takeText()
{
    if (_rows) {
        _text += _rows->text();
        _rows->clearText();
    }
    return std::exchange(_text, {});
}

void LiveRows::endRows()
{
    if (_rows)
        _text += _rows->text();
    _rows.reset();
}

void LiveRows::close()
{
    endRows();
    RowWriter::create(_options.format, captureName, {})->appendClosing(_text, _closing);
}

} // namespace ventrik
