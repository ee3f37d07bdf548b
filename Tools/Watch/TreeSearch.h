#pragma once

#include "Model/VentrikModelNode.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// The rows of a whole tree whose path or value holds a text, in any case, in the tree's order. It
/// takes a few bytes for each match, however long the names above it are.
class TreeSearch
{
  public:
    /// From the root's row down, the row in each pane.
    using Trail = std::vector<int>;

    TreeSearch() = default;
    /// The root may be none.
    TreeSearch(ModelNodePointer root, std::string_view text);

    std::size_t count() const { return _matches.size(); }
    const VentrikModelNode& node(std::size_t match) const;
    Trail trail(std::size_t match) const;
    /// The names on the way to the match and its own, joined by " › ".
    std::string names(std::size_t match) const;
    /// The first match behind a place, or the last before it; count() when there is none.
    std::size_t firstBehind(const Trail& place) const;
    std::size_t lastBefore(const Trail& place) const;

  private:
    class Walk;

    struct Holder {
        const VentrikModelNode* node;
        std::uint32_t above; // its own for the root
        std::uint32_t row;
    };
    struct Match {
        std::uint32_t holder;
        std::uint32_t row;
    };

    ModelNodePointer _root;
    std::vector<Holder> _holders; // those that hold matches somewhere below, and others
    std::vector<Match> _matches;
};

} // namespace ventrik
