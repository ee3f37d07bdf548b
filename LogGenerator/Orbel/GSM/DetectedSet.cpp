#include "LogGenerator/Orbel/GSM/DetectedSet.h"

namespace ventrik
{

DetectedSet::DetectedSet(SystemLog& log) : EmptySet(log, "DetectedSet") {}

std::string_view DetectedSet::getSectionName() const
{
    return "Detected Set";
}

} // namespace ventrik
