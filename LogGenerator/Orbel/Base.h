#pragma once

#include "LogGenerator/Orbel/CodeDictionary.h"
#include "LogGenerator/Orbel/RowList.h"
#include "LogGenerator/Orbel/SectionTable.h"
#include "LogGenerator/Orbel/ShownFields.h"
#include "Packets/Layouts.h"
#include "Packets/LogPacket.h"
#include "Platform/SystemLog.h"
#include "PropertyList/PlistValue.h"

#include <cstdint>
#include <list>
#include <optional>
#include <span>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace ventrik
{

/// Section names and their sections, which are not owned.
using ClassDictionary = std::unordered_map<std::string_view, Base*>;

/// A section: the decoder of one part of the display.
///
/// A class index creates it and registers it under its section name and its log codes; the
/// generator binds it to its container in the display object; each packet of its codes then updates
/// the container. A section never creates or removes its container, and writes to nothing while it
/// has none. Values are strings; a key keeps its last value until a new one can be formed.
///
/// Its table says what it shows. A subclass adds what a record decides beyond that.
class Base
{
  public:
    /// The table must outlive the section.
    Base(SystemLog& log, const SectionTable& table);
    virtual ~Base() = default;
    Base(const Base&) = delete;
    Base& operator=(const Base&) = delete;

    /// By which layouts the section reads its records; the newer ones where nobody says. Comes
    /// before it is registered: only those who ask for more get its records that have no base
    /// layout.
    void readRecords(RecordsMode mode);

    /// Registers the section under its name and for its codes.
    void initWithDict(ClassDictionary& classDictionary, CodeDictionary& codeDictionary);

    /// Binds the section to its container, a dictionary or an array, without keeping that alive.
    void updateSectionRef(const PlistValue& container);

    /// Decodes one packet, its transport prefix removed.
    void updateWithData(const LogPacket& packet, std::uint32_t logCode);
    /// A constant; also the section's key in the display template.
    std::string_view getSectionName() const { return _table.name; }
    /// The effective log codes that the section wants; may be empty.
    std::vector<std::uint32_t> getLogCodeArray() const;

    void updateLogCodeDict(CodeDictionary& codeDictionary);

    static void clearElementsInArray(PlistArray& array);
    /// Empties the array and appends the new elements in one locked step.
    static void replaceArray(PlistArray& array, const PlistArray& newElements);

    /// Ec/Io in whole dB for a raw energy; 0 where the raw value is out of range.
    static std::int16_t lookUpECNO(std::uint32_t rawValue);

    /// Where the value under a key of the section's dictionary comes from; none where no field of a
    /// record shows there.
    std::optional<ValueOrigin> originOf(std::string_view key) const;
    /// The same for a row of the section's list, or of the one under a key of its dictionary.
    std::optional<ValueOrigin> originOf(std::string_view listKey, std::size_t row,
                                        std::string_view key) const;

    /// What the value there shows; none where no field does.
    std::optional<ShownCell> cellAt(CellPlace& place) const;

    /// How the records were read that the section shows, the last one of each code.
    std::vector<ReadLayout> layouts() const;
    /// The same of the last packet; null where it was not read.
    const ReadLayout* lastRead() const { return _lastRead; }

  protected:
    /// Decodes a packet of the record, which is long enough: shows what the table says. The record
    /// is the one whose layout the packet has.
    virtual void decode(const ShownRecord& shown, const LogPacket& packet);

    SystemLog& log() const { return _log; }

    // Each shows a value in the section's dictionary. Keys are constants. The field's place counts
    // from the start.
    void show(const Field& field, std::int64_t raw, std::size_t start = 0);
    void showNumber(const Field& field, double number);
    void showValue(std::string_view key, PlistValue value);

    /// Begins to write the section's list anew. Where it has none, the rows go nowhere.
    RowList::Rewrite rewriteRows(const Record& record);
    /// Writes the elements of a record's list as the section's rows.
    void showRows(const Record& record, const List& list, const LogPacket& packet);

    void logUnknownMessage(std::uint32_t logCode) const;

    WeakContainer sectionRef;

  private:
    /// A record of the section's table, with what is known of its layouts.
    struct KnownRecord {
        ShownRecord shown;
        std::span<const Layout> layouts;
        std::vector<ShownRecord> newer; // the same by each layout but the base one
        std::optional<ReadLayout> last; // how the last packet was read
    };

    /// A list under a key of the section's dictionary.
    struct KeyedRows {
        std::string_view key;
        PlistArray array;
        RowList rows;
    };

    /// The section's dictionary, for the fields of the record that is being decoded.
    std::optional<PlistDictionary> beginFields();
    void withdraw(std::string_view key);
    void showFields(const ShownRecord& shown, const LogPacket& packet);
    void showKeyedRows(const Record& record, const List& list, const LogPacket& packet);
    void showMonitoredCells(const ShownRecord& shown, const LogPacket& packet);
    void showNeighbors(const ShownRecord& shown, const PlistArray& cells);
    const RowList* rowsUnder(std::string_view listKey) const;
    std::optional<ValueOrigin> withVersion(std::optional<ValueOrigin> origin) const;

    SystemLog& _log;
    const SectionTable& _table;
    std::vector<KnownRecord> _records;
    const Record* _current = nullptr; // which is being decoded
    const ReadLayout* _lastRead = nullptr;
    ShownFields _fields;
    RowList _rows;
    std::list<KeyedRows> _keyedRows;
};

/// A section that only shows what its table says.
template <const SectionTable& table>
class TableSection : public Base
{
  public:
    explicit TableSection(SystemLog& log) : Base(log, table) {}
};

} // namespace ventrik
