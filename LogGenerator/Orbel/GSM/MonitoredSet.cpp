#include "LogGenerator/Orbel/GSM/MonitoredSet.h"

namespace ventrik
{

MonitoredSet::MonitoredSet(SystemLog& log) : EmptySet(log, "MonitoredSet") {}

std::string_view MonitoredSet::getSectionName() const
{
    return "Monitored Set";
}

} // namespace ventrik
