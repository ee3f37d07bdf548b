#include "LogGenerator/Orbel/GSM/CellChangeCounters.h"

namespace ventrik
{

CellChangeCounters::CellChangeCounters(SystemLog& log)
    : PlaceholderSection(log, "CellChangeCounters")
{
}

std::string_view CellChangeCounters::getSectionName() const
{
    return "Cell Change Counters";
}

} // namespace ventrik
