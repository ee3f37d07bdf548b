#pragma once

#include "LogGenerator/Orbel/ClassIndex.h"
#include "LogGenerator/Orbel/LTE/ConnectedModeMeasurementMisc.h"
#include "LogGenerator/Orbel/LTE/DetectedCells.h"
#include "LogGenerator/Orbel/LTE/LTEServingCellInfo.h"
#include "LogGenerator/Orbel/LTE/MeasuredNeighborCells.h"
#include "LogGenerator/Orbel/LTE/NeighborCellsList.h"
#include "LogGenerator/Orbel/LTE/NeighborMeasurementMisc.h"
#include "LogGenerator/Orbel/LTE/ReselectionCandidatesList.h"
#include "LogGenerator/Orbel/LTE/ReselectionCandidatesMisc.h"
#include "LogGenerator/Orbel/LTE/ServingCellMeasurement.h"
#include "LogGenerator/Orbel/PDPContextList.h"
#include "LogGenerator/Orbel/SimInfo.h"

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
    MeasuredNeighborCells objMeasuredNeighborCells;
    DetectedCells objDetectedCells;
    ServingCellMeasurement objServingCellMeasurement;
    NeighborMeasurementMisc objNeighborMeasurementMisc;
    NeighborCellsList objNeighborCellsList;
    ReselectionCandidatesMisc objReselectionCandidatesMisc;
    ReselectionCandidatesList objReselectionCandidatesList;
    SimInfo objSimInfo;
    PDPContextList objPDPContextList;
};

} // namespace ventrik
