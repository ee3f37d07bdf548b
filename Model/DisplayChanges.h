#pragma once

#include "LogGenerator/Core/LogGenerator.h"
#include "PropertyList/ChangeLog.h"
#include "PropertyList/PlistValue.h"

#include <cstdint>
#include <deque>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace ventrik
{

struct DisplayGroup;

/// A place of the display: of a value, an element of a list or a group.
struct DisplayPlace {
    std::string key;  ///< in its dictionary; in a list the element's number
    std::string text; ///< what shows; empty for what holds others
    const DisplayGroup* holder;
    bool isSorted; ///< shows as its holder's keys do that are in order
    /// Places that go leave their number to later ones, which have another serial.
    std::size_t number;
    std::uint64_t serial;
    mutable std::optional<CellPlace> cell = {}; ///< once it was looked for
};

/// The number that a text is which no field shows, as those of property lists; none where it is no
/// plain one.
std::optional<double> plainNumber(std::string_view text);

/// The same of a text that is a number and, behind a blank, a unit of levels.
struct Measurement {
    double number;
    std::string_view unit; ///< "dBm" or "dB"
};
std::optional<Measurement> measurementIn(std::string_view text);

/// What is to be said of a place.
struct DisplayPlaceDescription {
    std::string path;    ///< as the panes have it
    std::string name;    ///< the last part of the path
    std::string section; ///< outside of sections the group, where that is no element of a list
    std::optional<std::size_t> index; ///< in the innermost list on the way
};

/// A change of the display.
struct DisplayChange {
    enum class Kind {
        Shown, ///< a value that is new, or another one than before
        Empty, ///< a group that came without values; one that loses them later just stays
        Gone,  ///< a value, or an element or a group with all that it holds
    };
    Kind kind;
    const DisplayPlace* place; ///< lives until the next changes are taken
};

/// A dictionary or a list of the display, as it was when it was last looked at.
struct DisplayGroup {
    struct Entry {
        DisplayPlace* place;
        DisplayGroup* group; ///< null for a value
    };
    WeakContainer container = {};
    std::vector<Entry> entries = {};     ///< as they stand in the container
    const DisplayPlace* place = nullptr; ///< null for the display itself
    std::size_t token = 0;
    bool isNew = false; ///< another container than before
    bool isList = false;
    bool isSorted = false;
    bool hasDoubles = false;     ///< several keys have one label
    std::size_t markerPlace = 0; ///< in a sorted container, of what says so and is no entry
    bool isUsed = false;
};

/// Follows what changes in a display, at a cost that goes with the changes: it watches the
/// display's containers and compares only those that changed with what they showed before. All
/// changes, put together, give the display.
class DisplayChanges
{
  public:
    /// The generator, which tells numbers and sections, outlives it.
    explicit DisplayChanges(const LogGenerator& generator) : _generator(generator) {}

    /// What has changed in the state's display since the last time; all of it the first time.
    std::span<const DisplayChange> take(const PlistDictionary& state);

    /// Whether what stands in the order of its container has got another one than the changes
    /// tell, by what came at its end and what went, since it was last asked.
    bool takeReordered() { return std::exchange(_isReordered, false); }
    /// All places, in the order of the display, holders before what they hold. They live until the
    /// next changes are taken.
    std::vector<const DisplayGroup::Entry*> entries() const;
    /// Those of all values.
    std::vector<const DisplayPlace*> values() const;

    DisplayPlaceDescription describe(const DisplayPlace& place, const PlistDictionary& state) const;
    /// What a value shows, before the next message is decoded; none where no field does.
    std::optional<ShownCell> cellAt(const DisplayPlace& place, const PlistDictionary& state) const
    {
        return place.cell || findCell(place, state) ? _generator.cellAt(*place.cell) : std::nullopt;
    }

  private:
    void compare(DisplayGroup& group);
    const PlistValue* displayIn(const PlistDictionary& state);
    void prepareForChanges();
    template <typename Container>
    void compareWith(DisplayGroup& group, Container& container);
    template <typename Container>
    void compareValues(DisplayGroup& group, const Container& container,
                       const std::vector<std::size_t>& places);
    void compareAll(DisplayGroup& group, const PlistArray& array);
    void compareAll(DisplayGroup& group, const PlistDictionary& dictionary);
    void findDoubles(DisplayGroup& group) const;
    void repeatDoubles(const DisplayGroup& group, std::size_t firstChange);
    void repeat(const DisplayGroup::Entry& entry);
    std::vector<bool> takeOverKeys(DisplayGroup& group, const PlistDictionary& dictionary);
    void noteOrder(const std::vector<DisplayGroup::Entry>& former, const DisplayGroup& group,
                   const std::vector<bool>& areNew);
    void compareValue(DisplayGroup::Entry& entry, const PlistValue& value, bool isNew);
    void compareAnyValue(DisplayGroup::Entry& entry, const PlistValue& value, bool isNew);
    void compareContainer(DisplayGroup::Entry& entry, const PlistValue& value, bool isNew);
    void goBeforeAnotherKind(const DisplayPlace& place);
    void follow(DisplayGroup& group, const PlistValue& container);
    bool isFollowed(const DisplayGroup& group, const PlistValue& container) const;
    DisplayGroup& newGroup(const DisplayPlace* place);
    DisplayPlace& newPlace(const DisplayGroup& holder, std::string_view key);
    void remove(const DisplayGroup::Entry& entry);
    void release(const DisplayGroup::Entry& entry);
    void release(DisplayGroup& group);
    void add(DisplayChange::Kind kind, const DisplayPlace& place)
    {
        _changes.push_back({kind, &place});
    }
    /// Where to look for what the value shows; false where that is not known yet.
    bool findCell(const DisplayPlace& place, const PlistDictionary& state) const;
    /// The way to a place, from the outside in; lives until it is asked for another one.
    std::span<const std::string_view> keysOf(const DisplayPlace& place) const;

    const LogGenerator& _generator;
    std::shared_ptr<ChangeLog> _log = std::make_shared<ChangeLog>();
    DisplayGroup* _root = nullptr;
    std::vector<DisplayChange> _changes;

    // Groups by their tokens, places by their numbers. What goes is free when the changes have been
    // looked at.
    std::deque<DisplayGroup> _groups;
    std::deque<DisplayPlace> _places;
    std::vector<std::size_t> _freeGroups;
    std::vector<std::size_t> _goneGroups;
    std::vector<std::size_t> _freePlaces;
    std::vector<std::size_t> _gonePlaces;
    std::uint64_t _lastSerial = 0;
    bool _isReordered = false;

    mutable std::vector<std::string_view> _keys;
    std::vector<std::size_t> _tokens; // room for those of the groups that changed
    std::size_t _displayPlace = 0;    // in the state, as far as is known
};

} // namespace ventrik
