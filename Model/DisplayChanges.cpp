#include "Model/DisplayChanges.h"

#include "LogGenerator/Core/StateKeys.h"
#include "LogGenerator/Orbel/ArrayLock.h"
#include "Model/DisplayNames.h"
#include "Model/PathIndex.h"

#include <algorithm>
#include <charconv>
#include <map>
#include <set>
#include <unordered_map>
#include <utility>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

bool isContainer(const PlistValue& value)
{
    return value.array() || value.dictionary();
}

bool isList(const PlistValue& container)
{
    return container.array() != nullptr;
}

// What the screens show of a value that holds no others.
std::string_view shownText(const PlistValue& value)
{
    return value.string() ? std::string_view(*value.string()) : notText;
}

const PlistValue& valueOf(const PlistValue& element)
{
    return element;
}

const PlistValue& valueOf(const PlistDictionary::Entry& entry)
{
    return entry.value;
}

std::string_view nameOf(const DisplayPlace& place)
{
    return place.isSorted ? labelOfSortedKey(place.key) : place.key;
}

// Most values keep their length.
void keepText(std::string& kept, std::string_view text)
{
    if (kept.size() == text.size())
        std::copy_n(text.data(), text.size(), kept.data());
    else
        kept = text;
}

void joinPathOf(const DisplayPlace& place, std::string& path)
{
    if (const DisplayPlace* holder = place.holder->place)
        joinPathOf(*holder, path);
    joinPath(path, nameOf(place));
}

std::optional<std::size_t> indexOf(const DisplayPlace& place)
{
    if (!place.holder->isList)
        return place.holder->place ? indexOf(*place.holder->place) : std::nullopt;
    std::size_t index = 0;
    std::from_chars(place.key.data(), place.key.data() + place.key.size(), index);
    return index;
}

} // namespace

// What begins with zeros or is very long is rather the name of something.
std::optional<double> plainNumber(std::string_view text)
{
    constexpr std::size_t longest = 15;
    const std::string_view digits = text.substr(text.starts_with('-') ? 1 : 0);
    const bool isNumber = !digits.empty() && digits.size() <= longest &&
                          digits.find_first_not_of("0123456789.") == digits.npos &&
                          digits.front() != '.' && digits.back() != '.' &&
                          std::ranges::count(digits, '.') <= 1;
    if (!isNumber || (digits.size() > 1 && digits.front() == '0' && digits[1] != '.'))
        return std::nullopt;
    double number = 0;
    std::from_chars(text.data(), text.data() + text.size(), number);
    return number;
}

std::optional<Measurement> measurementIn(std::string_view text)
{
    for (const std::string_view unit : {std::string_view("dBm"), std::string_view("dB")}) {
        const std::size_t size = unit.size() + 1;
        if (text.size() <= size || !text.ends_with(unit) || text[text.size() - size] != ' ')
            continue;
        const std::string_view digits = text.substr(0, text.size() - size);
        if (const auto number = plainNumber(digits.starts_with('+') ? digits.substr(1) : digits))
            return Measurement{*number, unit};
    }
    return std::nullopt;
}

std::span<const DisplayChange> DisplayChanges::take(const PlistDictionary& state)
{
    prepareForChanges();
    const PlistValue* display = displayIn(state);
    const bool isOther =
        display && isContainer(*display) && !(_root && isFollowed(*_root, *display));
    if (!isOther && _log->empty())
        return {};
    const ArrayLock::Scope locked;
    if (isOther) {
        if (!_root)
            _root = &newGroup(nullptr);
        follow(*_root, *display);
        compare(*_root);
    }
    _log->takeInto(_tokens);
    for (const std::size_t token : _tokens)
        if (DisplayGroup& group = _groups[token]; group.isUsed)
            compare(group);
    return _changes;
}

const PlistValue* DisplayChanges::displayIn(const PlistDictionary& state)
{
    const PlistDictionary::Entry* entry = state.entryAt(_displayPlace);
    if (!entry || entry->key != StateKey::display) {
        _displayPlace = state.placeOf(StateKey::display).value_or(state.size());
        entry = state.entryAt(_displayPlace);
    }
    return entry ? &entry->value : nullptr;
}

void DisplayChanges::prepareForChanges()
{
    _changes.clear();
    for (const std::size_t token : _goneGroups) {
        _groups[token] = {};
        _freeGroups.push_back(token);
    }
    _goneGroups.clear();
    _freePlaces.insert(_freePlaces.end(), _gonePlaces.begin(), _gonePlaces.end());
    _gonePlaces.clear();
}

void DisplayChanges::compare(DisplayGroup& group)
{
    if (!group.isList) {
        if (auto dictionary = group.container.dictionary())
            compareWith(group, *dictionary);
    } else if (auto array = group.container.array()) {
        compareWith(group, *array);
    }
}

template <typename Container>
void DisplayChanges::compareWith(DisplayGroup& group, Container& container)
{
    ContainerWatch& watch = container.watch();
    const auto* places = group.isNew ? nullptr : watch.changedValues();
    group.isNew = false;
    if (places && !group.hasDoubles)
        compareValues(group, container, *places);
    else
        compareAll(group, container);
    watch.add(_log, group.token);
}

// Nearly all changes are of one text to another.
inline void DisplayChanges::compareValue(DisplayGroup::Entry& entry, const PlistValue& value,
                                         bool isNew)
{
    const std::string* text = value.string();
    if (!text || entry.group || isNew)
        return compareAnyValue(entry, value, isNew);
    if (entry.place->text == *text)
        return;
    keepText(entry.place->text, *text);
    add(DisplayChange::Kind::Shown, *entry.place);
}

template <typename Container>
void DisplayChanges::compareValues(DisplayGroup& group, const Container& container,
                                   const std::vector<std::size_t>& places)
{
    const auto* const values = container.begin();
    for (const std::size_t place : places) {
        if (group.isSorted && place == group.markerPlace)
            continue;
        const std::size_t entry = place - (group.isSorted && place > group.markerPlace ? 1 : 0);
        if (entry < group.entries.size())
            compareValue(group.entries[entry], valueOf(values[place]), false);
    }
}

void DisplayChanges::compareAll(DisplayGroup& group, const PlistArray& array)
{
    while (group.entries.size() > array.size()) {
        remove(group.entries.back());
        group.entries.pop_back();
    }
    for (std::size_t i = 0; i < array.size(); ++i) {
        const bool isNew = i == group.entries.size();
        if (isNew)
            group.entries.push_back({&newPlace(group, fmt::format_int(i).str()), nullptr});
        compareValue(group.entries[i], array[i], isNew);
    }
}

void DisplayChanges::compareAll(DisplayGroup& group, const PlistDictionary& dictionary)
{
    std::vector<bool> areNew;
    const std::size_t before = _changes.size();
    const bool isSorted = dictionary.contains(sortedMarker);
    auto known = group.entries.begin();
    const bool hasSameKeys =
        isSorted == group.isSorted &&
        group.entries.size() == dictionary.size() - (isSorted ? 1 : 0) &&
        std::ranges::all_of(dictionary, [&](const PlistDictionary::Entry& entry) {
            return entry.key == sortedMarker || (known++)->place->key == entry.key;
        });
    if (!hasSameKeys)
        areNew = takeOverKeys(group, dictionary);
    group.markerPlace = dictionary.placeOf(sortedMarker).value_or(0);
    std::size_t i = 0;
    for (const auto& [key, value] : dictionary)
        if (key != sortedMarker) {
            compareValue(group.entries[i], value, !areNew.empty() && areNew[i]);
            ++i;
        }
    const bool hadDoubles = group.hasDoubles;
    if (isSorted && !hasSameKeys)
        findDoubles(group);
    if ((hadDoubles || group.hasDoubles) && _changes.size() > before)
        repeatDoubles(group, before);
}

void DisplayChanges::findDoubles(DisplayGroup& group) const
{
    std::set<std::string_view> names;
    group.hasDoubles = !std::ranges::all_of(group.entries, [&](const DisplayGroup::Entry& entry) {
        return names.insert(nameOf(*entry.place)).second;
    });
}

// Of several keys with one label the last one stands at their path, whichever has changed or gone.
void DisplayChanges::repeatDoubles(const DisplayGroup& group, std::size_t firstChange)
{
    std::map<std::string_view, const DisplayGroup::Entry*> lasts;
    std::set<std::string_view> doubles;
    for (const DisplayGroup::Entry& entry : group.entries) {
        const auto [last, isFirst] = lasts.emplace(nameOf(*entry.place), &entry);
        if (!isFirst)
            doubles.insert(last->first);
        if (!isFirst && last->second->place->key < entry.place->key)
            last->second = &entry;
    }
    for (std::size_t i = firstChange; i < _changes.size(); ++i)
        if (_changes[i].kind == DisplayChange::Kind::Gone && _changes[i].place->holder == &group)
            doubles.insert(nameOf(*_changes[i].place));
    for (const std::string_view name : doubles)
        if (const auto last = lasts.find(name); last != lasts.end())
            repeat(*last->second);
}

void DisplayChanges::repeat(const DisplayGroup::Entry& entry)
{
    if (!entry.group)
        return add(DisplayChange::Kind::Shown, *entry.place);
    if (entry.group->entries.empty())
        add(DisplayChange::Kind::Empty, *entry.place);
    for (const DisplayGroup::Entry& below : entry.group->entries)
        repeat(below);
}

// The group's entries become those of the dictionary's keys; tells which of them are new.
std::vector<bool> DisplayChanges::takeOverKeys(DisplayGroup& group,
                                               const PlistDictionary& dictionary)
{
    std::unordered_map<std::string_view, DisplayGroup::Entry> present;
    const bool isSorted = dictionary.contains(sortedMarker);
    for (const DisplayGroup::Entry& entry : group.entries)
        if (isSorted != group.isSorted || !dictionary.contains(entry.place->key))
            remove(entry); // the names of all change, or it is gone
        else
            present.emplace(entry.place->key, entry);
    const auto former = std::exchange(group.entries, {});
    group.isSorted = isSorted;
    std::vector<bool> areNew;
    for (const auto& [key, value] : dictionary) {
        if (key == sortedMarker)
            continue;
        const auto known = present.find(key);
        areNew.push_back(known == present.end());
        group.entries.push_back(known == present.end()
                                    ? DisplayGroup::Entry{&newPlace(group, key), nullptr}
                                    : known->second);
    }
    noteOrder(former, group, areNew);
    return areNew;
}

// Those that stay come first, as they stood.
void DisplayChanges::noteOrder(const std::vector<DisplayGroup::Entry>& former,
                               const DisplayGroup& group, const std::vector<bool>& areNew)
{
    std::size_t next = 0;
    for (const DisplayGroup::Entry& entry : former)
        if (next < group.entries.size() && group.entries[next].place == entry.place)
            ++next;
    if (!group.isSorted && std::find(areNew.begin() + static_cast<std::ptrdiff_t>(next),
                                     areNew.end(), false) != areNew.end())
        _isReordered = true;
}

void DisplayChanges::compareAnyValue(DisplayGroup::Entry& entry, const PlistValue& value,
                                     bool isNew)
{
    if (isContainer(value))
        return compareContainer(entry, value, isNew);
    const std::string_view text = shownText(value);
    if (!isNew && !entry.group && entry.place->text == text)
        return;
    if (entry.group) {
        goBeforeAnotherKind(*entry.place);
        release(*std::exchange(entry.group, nullptr));
    }
    keepText(entry.place->text, text);
    add(DisplayChange::Kind::Shown, *entry.place);
}

void DisplayChanges::compareContainer(DisplayGroup::Entry& entry, const PlistValue& value,
                                      bool isNew)
{
    const bool isSameKind = entry.group && entry.group->isList == isList(value);
    if (isSameKind && isFollowed(*entry.group, value))
        return; // it tells by itself that it changes
    if (!isSameKind) {
        if (!isNew)
            goBeforeAnotherKind(*entry.place);
        if (entry.group)
            release(*entry.group);
        entry.place->text.clear();
        entry.group = &newGroup(entry.place);
    }
    DisplayGroup& group = *entry.group;
    follow(group, value);
    const std::size_t before = _changes.size();
    compare(group);
    if (!isSameKind && _changes.size() == before)
        add(DisplayChange::Kind::Empty, *group.place);
}

// What goes and comes again would stand at the end.
void DisplayChanges::goBeforeAnotherKind(const DisplayPlace& place)
{
    add(DisplayChange::Kind::Gone, place);
    if (!place.isSorted)
        _isReordered = true;
}

void DisplayChanges::follow(DisplayGroup& group, const PlistValue& container)
{
    if (group.isList != isList(container)) {
        std::ranges::for_each(group.entries, [&](const auto& entry) { remove(entry); });
        group.entries.clear();
    }
    group.container = WeakContainer(container);
    group.isNew = true;
    group.isList = isList(container);
}

bool DisplayChanges::isFollowed(const DisplayGroup& group, const PlistValue& container) const
{
    return group.container.refersTo(container);
}

DisplayGroup& DisplayChanges::newGroup(const DisplayPlace* place)
{
    if (_freeGroups.empty()) {
        _freeGroups.push_back(_groups.size());
        _groups.emplace_back();
    }
    DisplayGroup& group = _groups[_freeGroups.back()];
    group.token = _freeGroups.back();
    _freeGroups.pop_back();
    group.place = place;
    group.isUsed = true;
    return group;
}

DisplayPlace& DisplayChanges::newPlace(const DisplayGroup& holder, std::string_view key)
{
    if (_freePlaces.empty()) {
        _freePlaces.push_back(_places.size());
        _places.emplace_back();
    }
    DisplayPlace& place = _places[_freePlaces.back()];
    place = {std::string(key), {}, &holder, holder.isSorted, _freePlaces.back(), ++_lastSerial, {}};
    _freePlaces.pop_back();
    return place;
}

void DisplayChanges::remove(const DisplayGroup::Entry& entry)
{
    add(DisplayChange::Kind::Gone, *entry.place);
    release(entry);
}

void DisplayChanges::release(const DisplayGroup::Entry& entry)
{
    if (entry.group)
        release(*entry.group);
    _gonePlaces.push_back(entry.place->number);
}

void DisplayChanges::release(DisplayGroup& group)
{
    if (auto array = group.container.array())
        array->watch().remove(_log, group.token);
    else if (auto dictionary = group.container.dictionary())
        dictionary->watch().remove(_log, group.token);
    for (const DisplayGroup::Entry& entry : group.entries)
        release(entry);
    group.isUsed = false;
    _goneGroups.push_back(group.token);
}

std::vector<const DisplayGroup::Entry*> DisplayChanges::entries() const
{
    std::vector<const DisplayGroup::Entry*> entries;
    std::vector<const DisplayGroup::Entry*> pending;
    const auto addEntries = [&](const DisplayGroup& group) {
        for (auto entry = group.entries.rbegin(); entry != group.entries.rend(); ++entry)
            pending.push_back(&*entry);
    };
    if (_root)
        addEntries(*_root);
    while (!pending.empty()) {
        entries.push_back(pending.back());
        pending.pop_back();
        if (entries.back()->group)
            addEntries(*entries.back()->group);
    }
    return entries;
}

std::vector<const DisplayPlace*> DisplayChanges::values() const
{
    std::vector<const DisplayPlace*> values;
    for (const DisplayGroup::Entry* entry : entries())
        if (!entry->group)
            values.push_back(entry->place);
    return values;
}

std::span<const std::string_view> DisplayChanges::keysOf(const DisplayPlace& place) const
{
    _keys.clear();
    for (const DisplayPlace* step = &place; step; step = step->holder->place)
        _keys.push_back(step->key);
    std::ranges::reverse(_keys);
    return _keys;
}

DisplayPlaceDescription DisplayChanges::describe(const DisplayPlace& place,
                                                 const PlistDictionary& state) const
{
    std::string section(_generator.sectionAt(state, keysOf(place)));
    const DisplayGroup* group = place.holder;
    while (section.empty() && group->place && group->place->holder->isList)
        group = group->place->holder;
    if (section.empty() && group->place)
        section = nameOf(*group->place);
    std::string path;
    joinPathOf(place, path);
    return {std::move(path), std::string(nameOf(place)), std::move(section), indexOf(place)};
}

bool DisplayChanges::findCell(const DisplayPlace& place, const PlistDictionary& state) const
{
    place.cell = _generator.cellPlaceAt(state, keysOf(place));
    if (place.cell)
        place.cell->key = place.key;
    return place.cell.has_value();
}

} // namespace ventrik
