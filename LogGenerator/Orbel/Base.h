#pragma once

#include "LogGenerator/Orbel/CellMonitorArray.h"
#include "LogGenerator/Orbel/CodeDictionary.h"
#include "LogGenerator/Orbel/LogPacket.h"
#include "Platform/SystemLog.h"
#include "PropertyList/PlistValue.h"

#include <cstdint>
#include <optional>
#include <span>
#include <string>
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
class Base
{
  public:
    explicit Base(SystemLog& log) : _log(log) {}
    virtual ~Base() = default;
    Base(const Base&) = delete;
    Base& operator=(const Base&) = delete;

    /// Registers the section under its name and for its codes. A member, because both are virtual.
    void initWithDict(ClassDictionary& classDictionary, CodeDictionary& codeDictionary);

    /// Binds the section to its container, a dictionary or an array, without keeping that alive.
    void updateSectionRef(const PlistValue& container);

    /// Decodes one packet, its transport prefix removed.
    virtual void updateWithData(const LogPacket& packet, std::uint32_t logCode) = 0;
    /// A constant; also the section's key in the display template.
    virtual std::string_view getSectionName() const = 0;
    /// The effective log codes that the section wants; may be empty.
    virtual std::vector<std::uint32_t> getLogCodeArray() const = 0;

    void updateLogCodeDict(CodeDictionary& codeDictionary);

    static void clearElementsInArray(PlistArray& array);
    /// Empties the array and appends the new elements in one locked step.
    static void replaceArray(PlistArray& array, const PlistArray& newElements);

    /// Ec/Io in whole dB for a raw energy; 0 where the raw value is out of range.
    static std::int16_t lookUpECNO(std::uint32_t rawValue);

  protected:
    SystemLog& log() const { return _log; }

    /// Stores a value under a key of the section's dictionary.
    void show(std::string_view key, PlistValue value) const;
    /// Removes a key from the section's dictionary.
    void withdraw(std::string_view key) const;

    /// The cells of a cell-monitor packet; none, with two error lines, when there is no such array.
    std::optional<PlistArray> getCellArray(const LogPacket& packet) const;
    /// Shows each number that the cell has; reports each other one in a line that begins with the
    /// given name, and leaves its key as it was.
    void showCellFields(const PlistDictionary& cell, std::span<const CellField> fields,
                        std::string_view nameInLog) const;
    /// Puts a row for each neighbour cell of the technology in the place of the section's list. A
    /// packet without a cell array empties it. A number that a cell lacks is reported in a line
    /// that begins with the given name.
    void showNeighborCells(const LogPacket& packet, std::string_view technology,
                           std::span<const CellRowField> fields, std::string_view nameInLog) const;
    /// Empties the section's list.
    void clearRows() const;
    /// Puts the rows in the place of the section's list.
    void showRows(const PlistArray& rows) const;

    void logUnknownMessage(std::uint32_t logCode) const;

    WeakContainer sectionRef;

  private:
    SystemLog& _log;
};

} // namespace ventrik
