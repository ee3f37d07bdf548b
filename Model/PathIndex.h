#pragma once

#include <cstddef>
#include <deque>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace ventrik
{

class VentrikModelNode;

using ModelNodePointer = std::shared_ptr<const VentrikModelNode>;

/// The nodes of a display tree by their paths. Each place knows its last part and the place before
/// it, not its whole path: the index stays as large as the tree, however long the names in it are.
/// Names that hold "/" make deeper-looking paths; of several nodes with one path the one put there
/// last stays.
class PathIndex
{
  public:
    /// A path that is known to the index, with or without a node.
    class Place
    {
        friend class PathIndex;
        Place* before = nullptr; // none: this is "/"
        std::string part;
        ModelNodePointer node;
    };

    PathIndex() = default;
    PathIndex(const PathIndex&) = delete;
    PathIndex& operator=(const PathIndex&) = delete;

    /// The place of "/".
    Place& root() { return _root; }
    /// The place of a child: exactly one "/" between the two, none doubled.
    Place& join(Place& parent, std::string_view name);
    /// The holder is the place of the node that this one is a child of; the key is the name where
    /// none is given.
    void put(Place& place, ModelNodePointer node, const Place* holder, std::string key = {});

    /// The node at a path, or null.
    ModelNodePointer find(std::string_view path) const;
    /// The keys and row numbers under which the node at a path stands in the display, from the
    /// outside in; empty where there is no node. They last as long as the index does.
    std::vector<std::string_view> keysOf(std::string_view path) const;

  private:
    struct Key {
        const Place* before;
        std::string_view part;
        bool operator==(const Key&) const = default;
    };
    struct KeyHash {
        std::size_t operator()(const Key& key) const;
    };

    /// Who holds a node, and under which key.
    struct Holding {
        const Place* holder;
        std::string key; // empty: the node's name
    };

    Place& step(Place& before, std::string_view part);
    const Place* placeAt(std::string_view path) const;

    Place _root;
    std::deque<Place> _places; // all others; they stay where they are
    std::unordered_map<Key, Place*, KeyHash> _steps;
    // Of the places only where that is not the place before, under the node's name: a list of a
    // million rows needs none.
    std::unordered_map<const Place*, Holding> _holdings;
};

/// The path of a child, by the same rule.
std::string pathJoining(std::string_view path, std::string_view name);
/// The path becomes that of its child.
void joinPath(std::string& path, std::string_view name);

} // namespace ventrik
