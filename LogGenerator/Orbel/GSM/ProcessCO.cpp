#include "LogGenerator/Orbel/GSM/ProcessCO.h"

#include "LogGenerator/Orbel/GSM/MMStateRecord.h"

namespace ventrik
{

// The tag is the circuit-switched section's: readers of the log know the two by that one name.
ProcessCO::ProcessCO(SystemLog& log) : MobilityProcess(log, "ProcessCS", MMStateRecord::logCode) {}

std::string_view ProcessCO::getSectionName() const
{
    return "Process CO";
}

// The mobility record's state alone
//   13 u8 state
void ProcessCO::updateFromState(const LogPacket& packet)
{
    show("MM State", MMStateRecord::state(packet));
}

} // namespace ventrik
