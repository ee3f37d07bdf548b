#include "LogGenerator/Orbel/GSM/UMTSRRMeasurement.h"

namespace ventrik
{

UMTSRRMeasurement::UMTSRRMeasurement(SystemLog& log) : PlaceholderSection(log, "UMTSRRMeasurement")
{
}

std::string_view UMTSRRMeasurement::getSectionName() const
{
    return "UMTS RR Measurement";
}

} // namespace ventrik
