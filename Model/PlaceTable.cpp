#include "Model/PlaceTable.h"

#include "Model/DisplayNames.h"
#include "Model/PathIndex.h"

#include <algorithm>
#include <charconv>
#include <utility>

namespace ventrik
{

namespace
{

// What a place takes beside its texts: the table's and the index's own structures.
constexpr std::size_t bytesBeside = sizeof(PlaceTable::Place) + 80;

} // namespace

PlaceTable::PlaceTable()
{
    _places.push_back({root, HolderKind::Dictionary, {}, {}, {}});
}

std::optional<PlaceId> PlaceTable::find(PlaceId holder, HolderKind kind, std::string_view key) const
{
    const auto known = _ids.find({holder, kind, key});
    return known == _ids.end() ? std::nullopt : std::optional(known->second);
}

PlaceId PlaceTable::add(PlaceId holder, HolderKind kind, std::string_view key, std::string section)
{
    const auto id = static_cast<PlaceId>(_places.size());
    _bytes += bytesBeside + key.size() + section.size();
    _places.push_back({holder, kind, std::string(key), std::move(section), {}});
    _ids.emplace(Key{holder, kind, _places.back().key}, id);
    _places[holder].below.push_back(id);
    return id;
}

std::string_view PlaceTable::nameOf(PlaceId id) const
{
    const Place& place = _places[id];
    return place.holderKind == HolderKind::Sorted ? labelOfSortedKey(place.key)
                                                  : std::string_view(place.key);
}

std::string PlaceTable::pathOf(PlaceId id) const
{
    std::vector<std::string_view> names;
    for (; id != root; id = _places[id].holder)
        names.push_back(nameOf(id));
    std::string path = "/";
    for (auto name = names.rbegin(); name != names.rend(); ++name)
        joinPath(path, *name);
    return path;
}

std::optional<std::size_t> PlaceTable::indexOf(PlaceId id) const
{
    for (; id != root; id = _places[id].holder) {
        const Place& place = _places[id];
        if (place.holderKind != HolderKind::List)
            continue;
        std::size_t index = 0;
        std::from_chars(place.key.data(), place.key.data() + place.key.size(), index);
        return index;
    }
    return std::nullopt;
}

std::vector<std::string_view> PlaceTable::keysOf(PlaceId id) const
{
    std::vector<std::string_view> keys;
    for (; id != root; id = _places[id].holder)
        keys.push_back(_places[id].key);
    std::ranges::reverse(keys);
    return keys;
}

} // namespace ventrik
