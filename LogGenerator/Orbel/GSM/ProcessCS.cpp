#include "LogGenerator/Orbel/GSM/ProcessCS.h"

#include "LogGenerator/Orbel/GSM/MMStateRecord.h"
#include "LogGenerator/Orbel/Labels.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::array<std::string_view, 9> subStateLabels{
    "MM_NULL_SUBSTATE",        "MM_NO_IMSI",
    "MM_PLMN_SEARCH",          "MM_LIMITED_SERVICE",
    "MM_ATTEMPTING_TO_UPDATE", "MM_LOCATION_UPDATE_NEEDED",
    "MM_NO_CELL_AVAILABLE",    "MM_PLMN_SEARCH_NORMAL_SERVICE",
    "MM_NORMAL_SERVICE"};

constexpr std::array<std::string_view, 4> updateStatusLabels{
    "UPDATED", "NOT_UPDATED", "ROAMING_NOT_ALLOWED", "LOCATION_AREA_NOT_ALLOWED"};

} // namespace

ProcessCS::ProcessCS(SystemLog& log) : MobilityProcess(log, "ProcessCS", MMStateRecord::logCode) {}

std::string_view ProcessCS::getSectionName() const
{
    return "Process CS";
}

// The whole mobility record
//   13 u8 state | 14 u8 sub-state | 15 u8 location-update status
void ProcessCS::updateFromState(const LogPacket& packet)
{
    show("MM State", MMStateRecord::state(packet));
    show("MM Sub State", labelOr(subStateLabels, packet.u8(14), "Unknown"));
    show("LU Reject Cause", labelOr(updateStatusLabels, packet.u8(15), "Unknown"));
}

} // namespace ventrik
