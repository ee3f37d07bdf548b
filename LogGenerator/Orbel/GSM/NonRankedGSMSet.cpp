#include "LogGenerator/Orbel/GSM/NonRankedGSMSet.h"

namespace ventrik
{

NonRankedGSMSet::NonRankedGSMSet(SystemLog& log) : PlaceholderSection(log, "NonRankedGSMSet") {}

std::string_view NonRankedGSMSet::getSectionName() const
{
    return "Non-Ranked GSM Set";
}

} // namespace ventrik
