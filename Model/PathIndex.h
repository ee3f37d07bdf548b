#pragma once

#include <cstddef>
#include <deque>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>

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
    void put(Place& place, ModelNodePointer node) { place.node = std::move(node); }

    /// The node at a path, or null.
    ModelNodePointer find(std::string_view path) const;

  private:
    struct Key {
        const Place* before;
        std::string_view part;
        bool operator==(const Key&) const = default;
    };
    struct KeyHash {
        std::size_t operator()(const Key& key) const;
    };

    Place& step(Place& before, std::string_view part);

    Place _root;
    std::deque<Place> _places; // all others; they stay where they are
    std::unordered_map<Key, Place*, KeyHash> _steps;
};

/// The path of a child, by the same rule.
std::string pathJoining(std::string_view path, std::string_view name);

} // namespace ventrik
