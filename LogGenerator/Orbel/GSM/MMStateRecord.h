#pragma once

#include "LogGenerator/Orbel/Labels.h"
#include "LogGenerator/Orbel/LogPacket.h"

#include <array>

namespace ventrik
{

// Circuit-switched mobility management, 0x7131, at least 16 bytes
//   13 u8 state | 14 u8 sub-state | 15 u8 location-update status
namespace MMStateRecord
{
inline constexpr std::uint32_t logCode = 0x7131;

// Two labels carry a blank behind an underscore, and are shown so.
inline constexpr std::array<std::string_view, 26> stateLabels{
    "MM_NULL",
    "",
    "",
    "MM_LOCATION_UPDATE_INITIATED",
    "",
    "MM_WAIT_FOR_OUTGOING_MM_CONNECTION",
    "MM_CONNECTION_ACTIVE",
    "MM_IMSI_DETACH_INITIATED",
    "MM_PROCESS_CM_SERVICE_PROMPT",
    "MM_WAIT_FOR_NETWORK_COMMAND",
    "MM_LOCATION_UPDATE_REJECTED",
    "",
    "",
    "MM_WAIT_FOR_RR_CONNECTION_LU",
    "MM_WAIT_FOR_RR_CONNECTION_MM",
    "MM_WAIT_FOR_RR_CONNECTION_IMSI_DETACH",
    "",
    "MM_REESTABLISHMENT_INITIATED",
    "MM_WAIT_FOR_RR_ACTIVE",
    "MM_IDLE",
    "MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION",
    "MM_WAIT_FOR_RR_CONNECTION_ REESTABLISHMENT",
    "MM_WAIT_FOR_REESTABLISH_DECISION",
    "MM_LOCATION_UPDATING_PENDING",
    "",
    "MM_RR_CONNECTION_RELEASE_NOT_ALLOWED",
};

inline std::string_view state(const LogPacket& packet)
{
    return labelOr(stateLabels, packet.u8(13), "Unknown");
}
} // namespace MMStateRecord

} // namespace ventrik
