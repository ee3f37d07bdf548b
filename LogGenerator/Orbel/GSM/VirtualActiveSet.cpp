#include "LogGenerator/Orbel/GSM/VirtualActiveSet.h"

namespace ventrik
{

VirtualActiveSet::VirtualActiveSet(SystemLog& log) : EmptySet(log, "VirtualActiveSet") {}

std::string_view VirtualActiveSet::getSectionName() const
{
    return "Virtual Active Set";
}

} // namespace ventrik
