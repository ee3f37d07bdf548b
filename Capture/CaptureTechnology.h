#pragma once

#include <optional>
#include <span>
#include <string_view>

namespace ventrik
{

/// A technology as captures and command lines name it.
struct CaptureTechnology {
    int linkType;                ///< of the pcap file
    std::string_view identifier; ///< the telephony service's answer to "GetTechnology"
    std::string_view name;       ///< on the command line
};

std::span<const CaptureTechnology> captureTechnologies();

/// None for a link type that names no technology.
std::optional<CaptureTechnology> technologyOfLinkType(int linkType);
std::optional<CaptureTechnology> technologyNamed(std::string_view name);

} // namespace ventrik
