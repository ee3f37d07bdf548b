#include "LogGenerator/Orbel/GSM/MobilityProcess.h"

#include "LogGenerator/Orbel/GSM/RegistrationRecord.h"
#include "LogGenerator/Orbel/Labels.h"

#include <array>

namespace ventrik
{

namespace
{

// The state records of the two domains have one size.
constexpr std::size_t stateRecordMinimumSize = 16;

constexpr std::array<std::string_view, 7> registrationStateLabels{
    "REG_STATE_INACTIVE",      "REG_STATE_IDLE",          "REG_STATE_REGISTERING",
    "REG_STATE_DEREGISTERING", "REG_STATE_MANUAL_SEARCH", "REG_STATE_AUTOMATIC_SEARCH",
    "REG_STATE_OFFLINE"};

} // namespace

std::vector<std::uint32_t> MobilityProcess::getLogCodeArray() const
{
    return {_stateLogCode, RegistrationRecord::logCode};
}

void MobilityProcess::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("{}", _tag);
    if (logCode == RegistrationRecord::logCode)
        return updateFromRegistration(packet);
    if (logCode != _stateLogCode)
        return logUnknownMessage(logCode);
    if (packet.size() >= stateRecordMinimumSize)
        updateFromState(packet);
}

// The registration record's state
//   13 u8 registration state
void MobilityProcess::updateFromRegistration(const LogPacket& packet)
{
    if (packet.size() < RegistrationRecord::minimumSize)
        return;
    show("MM Service State", labelOr(registrationStateLabels, packet.u8(13), "Unknown"));
}

} // namespace ventrik
