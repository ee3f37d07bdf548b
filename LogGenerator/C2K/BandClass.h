#pragma once

#include <cstdint>
#include <string>

namespace ventrik
{

/// The name of a band class, for instance "450MHz band [5]".
std::string bandClassLabel(std::uint8_t bandClass);

} // namespace ventrik
