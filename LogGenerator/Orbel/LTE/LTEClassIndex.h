#pragma once

#include "LogGenerator/Orbel/ClassIndex.h"
#include "LogGenerator/Orbel/LTE/ConnectedModeMeasurementMisc.h"
#include "LogGenerator/Orbel/LTE/LTEServingCellInfo.h"
#include "LogGenerator/Orbel/LTE/ServingCellMeasurement.h"

namespace ventrik
{

/// The sections of the LTE family, in the order in which they see a packet that several want.
class LTEClassIndex : public ClassIndex
{
  public:
    explicit LTEClassIndex(SystemLog& log);

  private:
    LTEServingCellInfo objLTEServingCellInfo;
    ConnectedModeMeasurementMisc objConnectedModeMeasurementMisc;
    ServingCellMeasurement objServingCellMeasurement;
};

} // namespace ventrik
