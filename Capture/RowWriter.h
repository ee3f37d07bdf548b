#pragma once

#include "Packets/RecordCensus.h"
#include "Platform/Clock.h"

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// Rows as text: one for each value that changed, and one that closes each capture. Their columns
/// have a fixed order; `rowSchema` tells it.
enum class RowFormat {
    JsonLines, ///< one object a line
    Csv,       ///< a first line with the columns' names; null is nothing, an empty text is ""
    Influx,    ///< points in InfluxDB's line protocol, in the measurement "ventrik"
};

/// The columns, a line for each, behind one with the number of the schema.
std::string rowSchema();
/// What comes before all rows: of CSV the names of the columns.
std::string rowHeading(RowFormat format);

/// What a row tells of the record that changed a value.
struct RowRecord {
    std::size_t number; ///< in the capture, from 0
    Clock::TimePoint time;
    std::optional<std::uint32_t> subscription = {};
    std::optional<RecordKind> kind = {}; ///< none where no record tells
};

/// What a row tells of a value's place.
struct RowPlace {
    std::string_view section;
    std::string_view path;
    std::optional<std::size_t> index;
    std::string_view name;
};

struct RowValue {
    std::optional<double> number = {};
    std::string_view unit = {};                ///< empty where there is none
    std::optional<std::string_view> text = {}; ///< none: it went away
};

/// How the decoding of a capture ended.
struct RowClosing {
    std::string_view status; ///< "ok", "damaged" or "empty"
    std::optional<std::uint64_t> offset = {};
    std::string_view reason = {}; ///< empty where it is "ok"
    std::size_t records = 0;
    std::size_t decoded = 0; ///< of them, those of a code that the technology's decoders ask for
    std::size_t rows = 0;
    std::uint64_t bytes = 0; ///< of the records
};

/// Writes the rows of one capture. A row is the parts of its record, its place and its value, one
/// behind the other, of a point the record behind the others: whoever has many rows keeps the parts
/// that they share.
class RowWriter
{
  public:
    /// The technology is empty where it is not known.
    RowWriter(RowFormat format, std::string_view capture, std::string_view technology);

    bool isRecordLast() const { return _format == RowFormat::Influx; }

    /// The columns from the first one to the record's layout; of a point its time. It lives until
    /// the next one.
    std::string_view recordPart(const RowRecord& record);
    /// Those of a value's place.
    std::string placePart(const RowPlace& place) const;
    /// Adds the others, and the line's end.
    void addValue(std::string& row, const RowValue& value) const;

    void appendClosing(std::string& rows, const RowClosing& closing) const;

  private:
    /// The columns that tell the kind of a record, behind the end of the time.
    struct KindPart {
        std::optional<std::uint32_t> subscription;
        std::optional<RecordKind> kind;
        std::string text;       ///< empty: nothing yet
        std::size_t serial = 0; ///< another text has another one
    };

    bool isJson() const { return _format == RowFormat::JsonLines; }
    bool isPoint() const { return _format == RowFormat::Influx; }
    std::string_view timePart(Clock::TimePoint time);
    std::string tagsOf(const RowPlace& place) const;
    void addFields(std::string& point, const RowValue& value) const;
    void appendClosingPoint(std::string& rows, const RowClosing& closing) const;
    const KindPart& kindPart(const RowRecord& record);
    /// A column's name, in JSON, and a text. Names come as `,"name":`.
    void addText(std::string& row, std::string_view column, std::string_view text) const;
    void addNull(std::string& row, std::string_view column) const;
    void addTextOrNull(std::string& row, std::string_view column, std::string_view text) const;
    /// A number, or a text that needs no quotes in CSV and is one in JSON.
    template <typename Number>
    void addNumber(std::string& row, std::string_view column, const Number& number) const;
    void addName(std::string& row, std::string_view column) const;

    RowFormat _format;
    std::string _capture; // the column of that name
    std::string _technology;
    std::string _csvEnd;              // of a row
    std::vector<KindPart> _kindParts; // each where its kind leads
    std::string _recordPart;          // of the last record; empty while there is none
    std::chrono::sys_seconds _second{};
    std::string _secondPart;      // of that second; empty while there is none
    std::size_t _kind = 0;        // its part's serial
    std::size_t _lastKind = 0;    // that was given
    std::size_t _numberStart = 0; // of what changes in that part
    std::size_t _numberSize = 0;
    std::size_t _fractionStart = 0;
};

} // namespace ventrik
