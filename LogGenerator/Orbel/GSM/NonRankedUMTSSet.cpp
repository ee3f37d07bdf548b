#include "LogGenerator/Orbel/GSM/NonRankedUMTSSet.h"

namespace ventrik
{

NonRankedUMTSSet::NonRankedUMTSSet(SystemLog& log) : PlaceholderSection(log, "NonRankedUMTSSet") {}

std::string_view NonRankedUMTSSet::getSectionName() const
{
    return "Non-Ranked UMTS Set";
}

} // namespace ventrik
