#pragma once

#include "PropertyList/PlistValue.h"

#include <cstdint>
#include <unordered_set>

namespace ventrik
{

/// Which messages a log channel's client wants, by their effective log codes.
class WantedCodes
{
  public:
    /// None.
    WantedCodes() = default;
    /// Those of a start command. The cell monitor's has no lists of codes: it wants everything.
    explicit WantedCodes(const PlistDictionary& startCommand);

    bool wantsAll() const { return _wantsAll; }
    const std::unordered_set<std::uint64_t>& codes() const { return _codes; }
    bool wants(ByteView message) const;

  private:
    bool _wantsAll = false;
    std::unordered_set<std::uint64_t> _codes;
};

} // namespace ventrik
