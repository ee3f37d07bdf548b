#include "LogGenerator/Orbel/LTE/LTEClassIndex.h"

namespace ventrik
{

LTEClassIndex::LTEClassIndex(SystemLog& log)
    : ClassIndex(log),
      objLTEServingCellInfo(log),
      objConnectedModeMeasurementMisc(log),
      objServingCellMeasurement(log)
{
    createSections(
        {&objLTEServingCellInfo, &objConnectedModeMeasurementMisc, &objServingCellMeasurement});
}

} // namespace ventrik
