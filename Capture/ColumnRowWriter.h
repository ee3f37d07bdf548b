#pragma once

#include "Capture/RowWriter.h"

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// Rows of the columns that `rowSchema` tells. A kind of them says what stands around the columns'
/// values, and how a text is written.
class ColumnRowWriter : public RowWriter
{
  public:
    RecordPart recordPart(const RowRecord& record) final;
    std::string placePart(const RowPlace& place) const final;
    void addValue(std::string& row, const RowValue& value) const final;
    void appendClosing(std::string& rows, const RowClosing& closing) const final;

  protected:
    struct Marks {
        std::size_t nameLength;        ///< so much is written of `,"name":`
        std::string nothing = {};      ///< where a column has no value
        std::string quote = {};        ///< around a time
        std::string valueEnd = {};     ///< of a row of values
        std::string closingFront = {}; ///< behind the capture of the closing row
        std::string closingEnd = {};   ///< of that one
    };

    /// The capture comes as the column of that name is written, with all that stands before it.
    ColumnRowWriter(Marks marks, std::string capture, std::string_view technology);

    virtual void addText(std::string& row, std::string_view text) const = 0;

  private:
    /// The columns that tell the kind of a record, behind the end of the time.
    struct KindPart {
        std::optional<std::uint32_t> subscription;
        std::optional<RecordKind> kind;
        std::string text;       ///< empty: nothing yet
        std::size_t serial = 0; ///< another text has another one
    };

    const KindPart& kindPart(const RowRecord& record);
    void beginSecond(std::chrono::sys_seconds second);

    // Columns. Their names come as `,"name":`.
    void addName(std::string& row, std::string_view name) const;
    void addNothing(std::string& row, std::string_view name) const;
    void addColumn(std::string& row, std::string_view name, std::string_view text) const;
    /// Nothing where the text is empty.
    void addTextOrNothing(std::string& row, std::string_view name, std::string_view text) const;
    /// A number, or nothing.
    template <typename Number>
    void addNumber(std::string& row, std::string_view name, const Number& number) const;

    Marks _marks;
    std::string _capture; // the column of that name
    std::string _technology;
    std::vector<KindPart> _kindParts; // each where its kind leads
    std::size_t _lastKind = 0;        // the serial that was given last

    // The part of the last record: its number, its time up to the second, the rest of that and its
    // kind. What the next one shares stays.
    std::string _record;
    std::size_t _numberStart = 0;
    std::size_t _numberSize = 0;
    std::size_t _fractionStart = 0;
    std::size_t _kind = 0; // its part's serial
    std::chrono::sys_seconds _second{};
    std::string _secondPart; // of that second; empty while there is none
};

} // namespace ventrik
