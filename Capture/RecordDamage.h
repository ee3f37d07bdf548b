#pragma once

#include "Capture/SkippedCount.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// What a file of log records holds beside them.
class RecordDamage
{
  public:
    /// Bytes that are no record.
    void addBytes(std::uint64_t offset, std::uint64_t count);
    /// A record behind a type byte where a record alone was to be.
    void addTyped(std::uint64_t offset) { _typed.add(offset); }
    /// A packet that ends before its time.
    void addShort(std::uint64_t offset) { _short.add(offset); }

    /// A line for each kind, behind the capture's name.
    void tell(std::vector<std::string>& notes, std::string_view name) const;

  private:
    SkippedCount _typed;
    SkippedCount _short;
    std::uint64_t _bytes = 0;
    std::uint64_t _places = 0;
    std::uint64_t _firstOffset = 0;
};

} // namespace ventrik
