#pragma once

#include "PropertyList/PlistValue.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace ventrik
{

/// "%+.2f dB" of a strength in steps of 1/512; of 0 it is minus infinity.
std::string pilotStrength(std::uint16_t rawStrength);

/// Pilots by their place in a record and their PN offset, as a group that the display sorts.
class PilotGroup
{
  public:
    void add(std::size_t index, std::uint16_t pnOffset, std::string_view text);

    const PlistDictionary& group() const { return _group; }
    /// The group, or "(none)" while it has no pilot.
    PlistValue groupOrNone() const;

  private:
    PlistDictionary _group{{"_sorted", "_sorted"}};
};

} // namespace ventrik
