#pragma once

#include "LogGenerator/Core/ValueOrigin.h"
#include "LogGenerator/Orbel/ArrayLock.h"
#include "LogGenerator/Orbel/FieldBytes.h"
#include "LogGenerator/Orbel/TextMemory.h"
#include "PropertyList/PlistValue.h"

#include <list>
#include <string_view>
#include <vector>

namespace ventrik
{

/// What a list of the display shows, row by row: the fields of each row in their order, and the raw
/// numbers that they show. A row's field that comes with the same number again is neither formatted
/// nor stored; of a row that begins with the fields of a table, those whose bytes are the same
/// again are not even read.
class RowList
{
  public:
    class Rewrite;

    /// What happens to containers that change.
    enum class Containers {
        Kept,
        Copied, ///< whoever holds the list from before keeps it as it was
    };

    /// Nothing is known of what the list shows: every row is written anew.
    void forgetAll() { _rows.clear(); }

    /// None for a key that the row does not show. The version is for the caller to fill in.
    std::optional<ValueOrigin> originOf(std::size_t row, std::string_view key) const;
    /// None for a key that no field of the row shows. The slot is where to look first; the key
    /// becomes that of the field.
    std::optional<ShownCell> cellOf(std::size_t row, std::string_view& key,
                                    std::size_t& slot) const;

  private:
    struct Cell {
        const Field* field; // null: a value that no field describes
        std::int64_t raw;
        bool isWorkedOut; // the raw number is none of the record's
    };
    struct Row {
        PlistDictionary values;
        std::vector<Cell> cells; // one for each of the values, in their order
        const Record* record = nullptr;
        std::size_t start = 0;
        /// Whose fields the first cells show, one by one; null: they do not.
        const FieldBytes* table = nullptr;
        FieldBytes::Words words = {}; // of that table
    };

    const FieldBytes& tableOf(std::span<const Field> fields);

    std::vector<Row> _rows;
    std::list<FieldBytes> _tables;
    TextMemory _texts;
};

/// Writes a list anew, from its first row on, under the array lock. What it is not given goes: rows
/// and, in a row, values behind those that were shown.
class RowList::Rewrite
{
  public:
    /// The record is the one that the following rows are read from. Without an array they go
    /// nowhere.
    Rewrite(RowList& list, std::optional<PlistArray> array, const Record& record,
            Containers containers = Containers::Kept);
    ~Rewrite();
    Rewrite(const Rewrite&) = delete;
    Rewrite& operator=(const Rewrite&) = delete;

    /// Begins the next row. Its fields' places count from the start.
    void nextRow(std::size_t start = 0);
    /// Adds a text in the place of a row.
    void nextText(const Field& field, std::int64_t raw, std::size_t start = 0);

    // Each adds one value to the row, under a key that it does not have yet.
    void show(const Field& field, std::int64_t raw);
    /// Shows a number that was worked out from the record, in the field's format.
    void showWorkedOut(const Field& field, std::int64_t number);
    void showValue(std::string_view key, PlistValue value);

    /// Shows a table of fields, a constant.
    void show(std::span<const Field> fields, const LogPacket& element);
    /// Shows a list of texts: so many as the element's places, one behind the other, the field has.
    void showTexts(const Field& field, std::int64_t raw, const Field& element);

    /// Adds the elements of a list, a row for each that is complete, or a text; and ends the list.
    /// Gives the array that holds it now.
    PlistArray showElements(const List& list, const LogPacket& packet);

  private:
    void beginRow(std::size_t start);
    Row& row() { return _list._rows[_count - 1]; }
    void showAll(std::span<const Field> fields, const LogPacket& element);
    /// The fields of those bits; false when the row has to be written whole.
    bool showChanged(std::span<const Field> fields, std::uint64_t changed,
                     const LogPacket& element);
    bool isShown(const Field& field, std::int64_t raw, bool isWorkedOut);
    /// The value of the row's next cell, which shows that from now on.
    PlistValue& nextValue(std::string_view key, Cell cell);
    void endRow();
    void endList();
    void copyArray();
    void copyRow();

    ArrayLock::Scope _locked;
    RowList& _list;
    bool _isDetached;
    bool _areCopied;
    bool _isArrayToCopy; // before it changes
    bool _isRowToCopy = false;
    PlistArray _array;
    const Record& _record;
    std::size_t _count = 0; // rows so far
    std::size_t _cells = 0; // values of the row so far
};

} // namespace ventrik
