#include "Model/PathIndex.h"

#include "Model/VentrikModelNode.h"

#include <algorithm>
#include <functional>

namespace ventrik
{

namespace
{

void removeLeadingSlashes(std::string_view& text)
{
    text.remove_prefix(std::min(text.find_first_not_of('/'), text.size()));
}

// Takes the part up to the next slash off the text, and the slash; false when nothing is left.
bool takePart(std::string_view& rest, std::string_view& part)
{
    if (!rest.data())
        return false;
    const auto slash = rest.find('/');
    part = rest.substr(0, slash);
    rest = slash == rest.npos ? std::string_view() : rest.substr(slash + 1);
    return true;
}

} // namespace

std::size_t PathIndex::KeyHash::operator()(const Key& key) const
{
    constexpr std::size_t spread = 0x9E3779B97F4A7C15;
    return std::hash<std::string_view>()(key.part) ^ std::hash<const Place*>()(key.before) * spread;
}

PathIndex::Place& PathIndex::join(Place& parent, std::string_view name)
{
    Place* place = &parent;
    while (place->before && place->part.empty()) // slashes at the path's end
        place = place->before;
    removeLeadingSlashes(name);
    if (name.empty())
        return *place;
    for (std::string_view part; takePart(name, part);)
        place = &step(*place, part);
    return *place;
}

PathIndex::Place& PathIndex::step(Place& before, std::string_view part)
{
    if (const auto found = _steps.find({&before, part}); found != _steps.end())
        return *found->second;
    Place& made = _places.emplace_back();
    made.before = &before;
    made.part = part;
    _steps.emplace(Key{&before, made.part}, &made);
    return made;
}

void PathIndex::put(Place& place, ModelNodePointer node, const Place* holder, std::string key)
{
    place.node = std::move(node);
    if (holder != place.before || !key.empty())
        _holdings.insert_or_assign(&place, Holding{holder, std::move(key)});
    else if (!_holdings.empty())
        _holdings.erase(&place);
}

const PathIndex::Place* PathIndex::placeAt(std::string_view path) const
{
    if (path == "/")
        return &_root;
    if (!path.starts_with('/'))
        return nullptr;
    path.remove_prefix(1);
    const Place* place = &_root;
    for (std::string_view part; takePart(path, part);) {
        const auto found = _steps.find({place, part});
        if (found == _steps.end())
            return nullptr;
        place = found->second;
    }
    return place;
}

ModelNodePointer PathIndex::find(std::string_view path) const
{
    const Place* place = placeAt(path);
    return place ? place->node : nullptr;
}

// The way out ends: a name leads deeper, and a node without one leaves its place to its holder, who
// is put there after it.
std::vector<std::string_view> PathIndex::keysOf(std::string_view path) const
{
    std::vector<std::string_view> keys;
    const Place* place = placeAt(path);
    while (place && place->node && place != &_root) {
        const auto held = _holdings.find(place);
        const bool hasKey = held != _holdings.end() && !held->second.key.empty();
        keys.push_back(hasKey ? held->second.key : place->node->displayName());
        place = held != _holdings.end() ? held->second.holder : place->before;
    }
    std::ranges::reverse(keys);
    return keys;
}

std::string pathJoining(std::string_view path, std::string_view name)
{
    std::string joined(path);
    joinPath(joined, name);
    return joined;
}

void joinPath(std::string& path, std::string_view name)
{
    while (path.ends_with('/'))
        path.pop_back();
    removeLeadingSlashes(name);
    if (!name.empty() || path.empty())
        path += '/';
    path += name;
}

} // namespace ventrik
