#pragma once

#include "LogGenerator/Orbel/ClassIndex.h"
#include "LogGenerator/Orbel/LTE/EPSRegistration.h"
#include "LogGenerator/Orbel/LTE/LTESections.h"
#include "LogGenerator/Orbel/LTE/LTEServingCellInfo.h"
#include "LogGenerator/Orbel/LTE/MeasuredNeighborCells.h"
#include "LogGenerator/Orbel/LTE/NeighborCellsList.h"
#include "LogGenerator/Orbel/LTE/NeighborSignal.h"
#include "LogGenerator/Orbel/LTE/ReselectionCandidatesList.h"
#include "LogGenerator/Orbel/LTE/ServingCellSignal.h"
#include "LogGenerator/Orbel/PDPContextList.h"
#include "LogGenerator/Orbel/SimInfo.h"

namespace ventrik
{

/// The sections of the LTE family, in the order in which they see a packet that several want.
class LTEClassIndex : public ClassIndex
{
  public:
    explicit LTEClassIndex(SystemLog& log, RecordsMode records = RecordsMode::Newer)
        : ClassIndex(log, records)
    {
        if (records != RecordsMode::Extended)
            return;
        add<ServingCellSignal>();
        add<SignalByCell>();
        add<ConnectedNeighbors>();
        add<ConnectedNeighborCells>();
        add<EPSRegistration>();
        add<LastRRCMessage>();
    }

  private:
    Base& objLTEServingCellInfo = add<LTEServingCellInfo>();
    Base& objConnectedModeMeasurementMisc = add<ConnectedModeMeasurementMisc>();
    Base& objMeasuredNeighborCells = add<MeasuredNeighborCells>();
    Base& objDetectedCells = add<DetectedCells>();
    Base& objServingCellMeasurement = add<ServingCellMeasurement>();
    Base& objNeighborMeasurementMisc = add<NeighborMeasurementMisc>();
    Base& objNeighborCellsList = add<NeighborCellsList>();
    Base& objReselectionCandidatesMisc = add<ReselectionCandidatesMisc>();
    Base& objReselectionCandidatesList = add<ReselectionCandidatesList>();
    Base& objSimInfo = add<SimInfo>();
    Base& objPDPContextList = add<PDPContextList>();
};

} // namespace ventrik
