#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace ventrik
{

/// A place of the display, by a number of its own.
using PlaceId = std::uint32_t;

/// The places that a display has had, whether anything stands there now or not. They stay.
class PlaceTable
{
  public:
    static constexpr PlaceId root = 0; ///< the display itself

    enum class HolderKind : std::uint8_t {
        Dictionary,
        Sorted, ///< a dictionary that shows its keys in their order
        List,
    };
    struct Place {
        PlaceId holder;
        HolderKind holderKind;
        std::string key;     ///< in its holder; in a list the element's number
        std::string section; ///< as rows tell it; empty outside of sections and groups
        std::vector<PlaceId> below = {};
    };

    PlaceTable();
    PlaceTable(const PlaceTable&) = delete;
    PlaceTable& operator=(const PlaceTable&) = delete;

    std::optional<PlaceId> find(PlaceId holder, HolderKind kind, std::string_view key) const;
    PlaceId add(PlaceId holder, HolderKind kind, std::string_view key, std::string section);

    std::size_t size() const { return _places.size(); }
    const Place& operator[](PlaceId id) const { return _places[id]; }
    /// As the panes show it.
    std::string_view nameOf(PlaceId id) const;
    /// As the panes have it.
    std::string pathOf(PlaceId id) const;
    /// In the innermost list on the way.
    std::optional<std::size_t> indexOf(PlaceId id) const;
    /// The way there from the outside in; lives as long as the table does.
    std::vector<std::string_view> keysOf(PlaceId id) const;
    /// About what it takes.
    std::size_t bytes() const { return _bytes; }

  private:
    struct Key {
        PlaceId holder;
        HolderKind kind;
        std::string_view key; // of the place itself
        bool operator==(const Key&) const = default;
    };
    struct KeyHash {
        std::size_t operator()(const Key& key) const
        {
            return std::hash<std::string_view>{}(key.key) * 31 + key.holder * 3 +
                   static_cast<std::size_t>(key.kind);
        }
    };

    std::deque<Place> _places; // they stay where they are
    std::unordered_map<Key, PlaceId, KeyHash> _ids;
    std::size_t _bytes = 0;
};

} // namespace ventrik
