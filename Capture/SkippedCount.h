#pragma once

#include "PropertyList/PlistValue.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// How often one kind of damage was skipped in a capture, and where first.
class SkippedCount
{
  public:
    void add(std::uint64_t offset)
    {
        if (_count == 0)
            _firstOffset = offset;
        ++_count;
    }
    /// Adds "NAME: N NOUNs REST, the first at offset M", unless nothing was skipped.
    void tell(std::vector<std::string>& notes, std::string_view name, std::string_view noun,
              std::string_view rest) const;
    /// "N, the first at offset M", or "0".
    std::string text() const;
    /// Adds that under the name, unless nothing was skipped.
    void addTo(PlistDictionary& report, std::string_view name) const;

  private:
    std::uint64_t _count = 0;
    std::uint64_t _firstOffset = 0;
};

} // namespace ventrik
