#pragma once

#include "Packets/RecordCensus.h"
#include "Platform/Clock.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

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

/// What a row tells of its record: what its first columns are in one format is its end in another.
struct RecordPart {
    std::string_view front = {};
    std::string_view back = {};
};

/// Writes the rows of one capture, one kind of them for each format. A row is the front of its
/// record's part, its place, its value and the back of its record's part, one behind the other:
/// whoever has many rows keeps the parts that they share.
class RowWriter
{
  public:
    /// The technology is empty where it is not known.
    static std::unique_ptr<RowWriter> create(RowFormat format, std::string_view capture,
                                             std::string_view technology);

    virtual ~RowWriter() = default;
    RowWriter(const RowWriter&) = delete;
    RowWriter& operator=(const RowWriter&) = delete;

    /// It lives until the next one.
    virtual RecordPart recordPart(const RowRecord& record) = 0;
    virtual std::string placePart(const RowPlace& place) const = 0;
    /// Adds the part that tells the value.
    virtual void addValue(std::string& row, const RowValue& value) const = 0;
    virtual void appendClosing(std::string& rows, const RowClosing& closing) const = 0;

  protected:
    RowWriter() = default;
};

} // namespace ventrik
