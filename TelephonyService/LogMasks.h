#pragma once

#include "PropertyList/Bytes.h"

#include <cstdint>
#include <map>
#include <set>
#include <vector>

namespace ventrik
{

/// Which log codes a diagnostic port sends. A code is an item (its lower 12 bits) of an equipment
/// (its upper 4 bits), and each equipment has a mask of its own.
class LogMasks
{
  public:
    void add(std::uint16_t code);
    bool empty() const { return _items.empty(); }

    /// The frames that bring a port from other masks to these: one for each equipment whose mask
    /// differs; where nothing is wanted any more, the one that disables all.
    std::vector<Bytes> commandsFrom(const LogMasks& before) const;
    /// The frame that disables all.
    static Bytes disablingCommand();

    bool operator==(const LogMasks&) const = default;

  private:
    using Items = std::set<std::uint16_t>;

    const Items& itemsOf(std::uint32_t equipment) const;

    std::map<std::uint32_t, Items> _items;
};

} // namespace ventrik
