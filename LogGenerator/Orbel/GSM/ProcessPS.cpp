#include "LogGenerator/Orbel/GSM/ProcessPS.h"

#include "LogGenerator/Orbel/Labels.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::uint32_t gmmStateLogCode = 0x7130;

constexpr std::array<std::string_view, 7> stateLabels{
    "GMM_NULL",
    "GMM_DEREGISTERED",
    "GMM_REGISTERED_INITIATED",
    "GMM_REGISTERED",
    "GMM_DEREGISTERED_INITIATED",
    "GMM_ROUTING_AREA_UPDATE_INITIATED",
    "GMM_SERVICE_REQUEST_INITIATED",
};

constexpr std::array<std::string_view, 13> subStateLabels{
    "GMM_NORMAL_SERVICE",
    "GMM_LIMITED_SERVICE",
    "GMM_ATTACH_NEEDED",
    "GMM_ATTEMPTING_TO_ATTACH",
    "GMM_NO_IMSI",
    "GMM_NO_CELL_AVAILABLE",
    "GMM_PLMN_SEARCH",
    "GMM_SUSPENDED",
    "GMM_UPDATE_NEEDED",
    "GMM_ATTEMPING_TO_UPDATE",
    "GMM_ATTEMPTING_TO_UPDATE_MM",
    "GMM_IMSI_DETACH_INITIATED",
    "GMM_NULL_SUBSTATE",
};

constexpr std::array<std::string_view, 4> updateStatusLabels{
    "GMM_GU1_UPDATED",
    "GMM_GU2_NOT_UPDATED",
    "GMM_GU3_PLMN_NOT_ALLOWED",
    "GMM_GU3_ROUTING_AREA_NOT_ALLOWED",
};

} // namespace

ProcessPS::ProcessPS(SystemLog& log) : MobilityProcess(log, "ProcessPS", gmmStateLogCode) {}

std::string_view ProcessPS::getSectionName() const
{
    return "Process PS";
}

// Packet-switched mobility management, 0x7130, at least 16 bytes
//   13 u8 state | 14 u8 sub-state | 15 u8 update status
// The keys are the circuit-switched ones: one name for one kind of state in either domain.
void ProcessPS::updateFromState(const LogPacket& packet)
{
    show("MM State", labelOr(stateLabels, packet.u8(13), "Unknown"));
    show("MM Sub State", labelOr(subStateLabels, packet.u8(14), "Unknown"));
    show("Attach Reject Cause", labelOr(updateStatusLabels, packet.u8(15), "Unknown"));
}

} // namespace ventrik
