#include "LogGenerator/Orbel/GSM/CodingScheme.h"

namespace ventrik
{

// The tag is the cell change counters': the two placeholders have always traced one name.
CodingScheme::CodingScheme(SystemLog& log) : PlaceholderSection(log, "CellChangeCounters") {}

std::string_view CodingScheme::getSectionName() const
{
    return "Coding Scheme";
}

} // namespace ventrik
