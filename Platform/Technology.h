#pragma once

#include "Platform/TelephonyConstants.h"
#include "PropertyList/PlistValue.h"

#include <optional>
#include <span>
#include <string_view>

namespace ventrik
{

/// A radio technology as the service, captures, command lines and people name it.
struct Technology {
    std::string_view identifier;  ///< the telephony service's answer to "GetTechnology"
    std::string_view name;        ///< on the command line
    int linkType;                 ///< of a pcap file
    std::string_view displayName; ///< for people
};

namespace Technologies
{
inline constexpr Technology cellMonitor{kQXLogChannelTechnology_IFX, "ifx", 147, "Cell monitor"};
inline constexpr Technology gsm{kQXLogChannelTechnology_Orbel_GSM, "gsm", 148, "GSM/UMTS"};
inline constexpr Technology c2k{kQXLogChannelTechnology_Orbel_CDMA, "c2k", 149, "CDMA2000"};
inline constexpr Technology lte{kQXLogChannelTechnology_Orbel_LTE, "lte", 150, "LTE"};
inline constexpr Technology utran{kQXLogChannelTechnology_Orbel_UTRAN2, "utran", 151, "UTRAN"};
} // namespace Technologies

std::span<const Technology> technologies();

// Each gives none for what names no technology.
std::optional<Technology> technologyOfIdentifier(const PlistValue& identifier);
std::optional<Technology> technologyOfLinkType(int linkType);
std::optional<Technology> technologyNamed(std::string_view name);

} // namespace ventrik
