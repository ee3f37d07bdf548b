#include "LogGenerator/Orbel/LTE/LTEClassIndex.h"

namespace ventrik
{

LTEClassIndex::LTEClassIndex(SystemLog& log)
    : ClassIndex(log),
      objLTEServingCellInfo(log),
      objConnectedModeMeasurementMisc(log),
      objMeasuredNeighborCells(log),
      objDetectedCells(log),
      objServingCellMeasurement(log),
      objNeighborMeasurementMisc(log),
      objNeighborCellsList(log),
      objReselectionCandidatesMisc(log),
      objReselectionCandidatesList(log),
      objSimInfo(log),
      objPDPContextList(log)
{
    createSections({&objLTEServingCellInfo, &objConnectedModeMeasurementMisc,
                    &objMeasuredNeighborCells, &objDetectedCells, &objServingCellMeasurement,
                    &objNeighborMeasurementMisc, &objNeighborCellsList,
                    &objReselectionCandidatesMisc, &objReselectionCandidatesList, &objSimInfo,
                    &objPDPContextList});
}

} // namespace ventrik
