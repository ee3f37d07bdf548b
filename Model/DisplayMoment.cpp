#include "Model/DisplayMoment.h"

#include "Model/DisplayNames.h"
#include "Model/LayoutWarnings.h"
#include "Model/PathIndex.h"
#include "Packets/Plausibility.h"

#include <algorithm>
#include <map>
#include <optional>
#include <utility>
#include <vector>

namespace ventrik
{

using HolderKind = PlaceTable::HolderKind;

/// Goes through the changes from a key state on, and keeps what stands at the end.
struct DisplayMoment::Content {
    struct Node {
        ChangeStore::Standing standing;
        std::vector<PlaceId> below; // that stand, in their order
    };

    explicit Content(const ChangeStore& store) : places(store._places), nodes(places->size()) {}

    void goThrough(const ChangeStore::Chunk& chunk, std::uint32_t changes);
    void show(PlaceId id, const ChangeStore::Standing& standing);
    void showHolder(PlaceId id);
    void remove(PlaceId id);
    void takeValues(const ChangeStore::Chunk& chunk);
    void hear(const ChangeStore::Chunk& chunk, std::uint32_t changes);
    void takeLayouts(const ChangeStore::Chunk& chunk, std::uint32_t changes);
    PlistValue displayOf(PlaceId id) const;
    std::optional<PlaceId> idAt(const std::string& path) const;

    std::shared_ptr<const PlaceTable> places;
    std::vector<Node> nodes;
    std::uint64_t moment = 0;
    Clock::TimePoint time;
    std::string technology;
    std::map<std::uint32_t, Clock::TimePoint> heard;
    std::map<PlaceId, Value> values;
    std::map<std::uint32_t, ReadLayout> layouts;
    std::map<std::uint32_t, std::vector<std::string>> sections; // of those codes
    std::deque<std::string> texts;
    PathIndex index;
    ModelNodePointer root;
};

void DisplayMoment::Content::goThrough(const ChangeStore::Chunk& chunk, std::uint32_t changes)
{
    const auto later =
        std::ranges::upper_bound(chunk.keyStates, changes, {}, &ChangeStore::KeyState::change);
    std::uint32_t i = 0;
    if (later != chunk.keyStates.begin()) {
        for (const auto& [id, standing] : std::prev(later)->places)
            show(id, standing);
        i = std::prev(later)->change;
    }
    for (; i < changes; ++i) {
        const ChangeStore::Change& change = chunk.changes[i];
        const ChangeStore::Message& message = chunk.messages[change.message];
        if (change.value == ChangeStore::nothing)
            remove(change.place);
        else
            show(change.place, {change.value, message.logCode, message.time, chunk.first + i});
    }
}

void DisplayMoment::Content::show(PlaceId id, const ChangeStore::Standing& standing)
{
    if (nodes[id].standing.value == ChangeStore::nothing) {
        showHolder(id);
        nodes[(*places)[id].holder].below.push_back(id);
    }
    nodes[id].standing = standing;
}

// What holds something is there, and a group.
void DisplayMoment::Content::showHolder(PlaceId id)
{
    const PlaceId holder = (*places)[id].holder;
    if (holder != PlaceTable::root && nodes[holder].standing.value == ChangeStore::nothing)
        show(holder, {.value = ChangeStore::group});
}

void DisplayMoment::Content::remove(PlaceId id)
{
    std::vector<PlaceId>& beside = nodes[(*places)[id].holder].below;
    if (!beside.empty() && beside.back() == id)
        beside.pop_back(); // lists lose their elements from the end
    else
        std::erase(beside, id);
    std::vector<PlaceId> pending{id};
    while (!pending.empty()) {
        Node& gone = nodes[pending.back()];
        pending.pop_back();
        pending.insert(pending.end(), gone.below.begin(), gone.below.end());
        gone = {};
    }
}

void DisplayMoment::Content::takeValues(const ChangeStore::Chunk& chunk)
{
    for (PlaceId id = 1; id < nodes.size(); ++id) {
        const ChangeStore::Standing& standing = nodes[id].standing;
        if (standing.value >= ChangeStore::group)
            continue;
        StoredValue value = chunk.valueAt(standing.value);
        value.text = texts.emplace_back(value.text);
        const auto again = heard.find(standing.logCode);
        const Clock::TimePoint written =
            again == heard.end() ? standing.time : std::max(standing.time, again->second);
        values.emplace(id, Value{value, standing.time, written, standing.logCode, standing.change});
    }
}

void DisplayMoment::Content::hear(const ChangeStore::Chunk& chunk, std::uint32_t changes)
{
    heard = chunk.heardBefore;
    for (const ChangeStore::Heard& again : chunk.heard)
        if (again.change <= changes && again.time <= time)
            heard[again.logCode] = again.time;
}

// The layout of the message that told the last change belongs to the moment, too.
void DisplayMoment::Content::takeLayouts(const ChangeStore::Chunk& chunk, std::uint32_t changes)
{
    layouts = chunk.layoutsBefore;
    for (const ChangeStore::NotedLayout& noted : chunk.layouts)
        if (noted.change < changes)
            layouts[noted.layout.logCode] = noted.layout;
    std::erase_if(layouts,
                  [](const auto& layout) { return layout.second.kind != LayoutKind::NotKnown; });
}

PlistValue DisplayMoment::Content::displayOf(PlaceId id) const
{
    const Node& node = nodes[id];
    if (const auto value = values.find(id); value != values.end())
        return value->second.shown.text;
    const HolderKind kind =
        node.below.empty() ? HolderKind::Dictionary : (*places)[node.below.front()].holderKind;
    if (kind == HolderKind::List) {
        PlistArray list;
        for (const PlaceId below : node.below)
            list.append(displayOf(below));
        return list;
    }
    PlistDictionary dictionary;
    for (const PlaceId below : node.below)
        dictionary.set((*places)[below].key, displayOf(below));
    if (kind == HolderKind::Sorted)
        dictionary.set(sortedMarker, sortedMarker);
    return dictionary;
}

std::optional<PlaceId> DisplayMoment::Content::idAt(const std::string& path) const
{
    PlaceId id = PlaceTable::root;
    for (const std::string_view key : index.keysOf(path)) {
        const auto& below = nodes[id].below;
        const auto found = std::ranges::find(
            below, key, [&](PlaceId place) -> std::string_view { return (*places)[place].key; });
        if (found == below.end())
            return std::nullopt;
        id = *found;
    }
    return id;
}

DisplayMoment::DisplayMoment(const ChangeStore& store, std::uint64_t moment)
    : DisplayMoment(store, moment,
                    moment == store.present() ? store.lastTime() : store.timeOf(moment))
{
}

DisplayMoment::DisplayMoment(const ChangeStore& store, std::uint64_t moment, Clock::TimePoint time)
    : _content(std::make_unique<Content>(store))
{
    Content& content = *_content;
    moment = std::clamp(moment, store.firstMoment(), store.present());
    content.moment = moment;
    content.time = std::max(time, store.timeOf(moment));
    content.technology = store.technologyAt(moment);
    const ChangeStore::Chunk* chunk = store.chunkAt(moment);
    if (!chunk)
        return;
    const auto changes = static_cast<std::uint32_t>(moment - chunk->first);
    content.goThrough(*chunk, changes);
    if (moment == store.present() && content.time >= store.lastTime()) {
        content.heard = store._lastHeard;
        content.layouts = store._layouts;
    } else {
        content.hear(*chunk, changes);
        content.takeLayouts(*chunk, changes);
    }
    content.sections = store._sections;
    content.takeValues(*chunk);
}

DisplayMoment::~DisplayMoment() = default;
DisplayMoment::DisplayMoment(DisplayMoment&&) noexcept = default;
DisplayMoment& DisplayMoment::operator=(DisplayMoment&&) noexcept = default;

std::uint64_t DisplayMoment::moment() const
{
    return _content->moment;
}

Clock::TimePoint DisplayMoment::time() const
{
    return _content->time;
}

const std::string& DisplayMoment::technology() const
{
    return _content->technology;
}

// Only whoever shows it needs a tree.
void DisplayMoment::build() const
{
    if (_content->root)
        return;
    const PlistValue display = _content->displayOf(PlaceTable::root);
    const bool isShown = !_content->nodes[PlaceTable::root].below.empty();
    _content->root =
        VentrikModelNode::makeTreeFromObject(isShown ? &display : nullptr, _content->index);
}

ModelNodePointer DisplayMoment::topLevelNodes()
{
    build();
    return _content->root;
}

ModelNodePointer DisplayMoment::nodeAtPath(const std::string& path)
{
    build();
    return _content->index.find(path);
}

std::string_view DisplayMoment::doubtAt(const std::string& path) const
{
    const Value* value = valueAt(path);
    return value && value->shown.field
               ? doubtOfShown(*value->shown.field, value->shown.raw, value->shown.text)
               : std::string_view();
}

std::vector<std::string_view> DisplayMoment::keysAt(const std::string& path) const
{
    build();
    return _content->index.keysOf(path);
}

std::vector<std::string> DisplayMoment::layoutWarningsAt(const std::string& path) const
{
    build();
    const auto id = _content->idAt(path);
    std::vector<ReadLayout> layouts;
    for (const auto& [code, layout] : _content->layouts) {
        const auto sections = _content->sections.find(code);
        if (id && *id != PlaceTable::root && sections != _content->sections.end() &&
            std::ranges::find(sections->second, (*_content->places)[*id].section) !=
                sections->second.end())
            layouts.push_back(layout);
    }
    return layoutWarnings(layouts);
}

const DisplayMoment::Value* DisplayMoment::valueAt(const std::string& path) const
{
    build();
    const auto id = _content->idAt(path);
    const auto value = id ? _content->values.find(*id) : _content->values.end();
    return value == _content->values.end() ? nullptr : &value->second;
}

} // namespace ventrik
