#pragma once

#include "PropertyList/PlistValue.h"
#include "Tests/Capture/PcapBytes.h"

#include <string_view>

#include <fmt/format.h>

namespace ventrik
{

inline constexpr std::uint32_t cellMonitorLinkType = 147;

/// A message of the cell monitor: a dictionary with this XML value under "Cell".
inline Bytes cellMonitorMessage(std::string_view value)
{
    const std::string text =
        fmt::format("<plist version=\"1.0\"><dict><key>Cell</key>{}</dict></plist>", value);
    return {text.begin(), text.end()};
}

} // namespace ventrik
