#include "LogGenerator/Orbel/GSM/Orbel_GSMClassIndex.h"

namespace ventrik
{

Orbel_GSMClassIndex::Orbel_GSMClassIndex(SystemLog& log)
    : ClassIndex(log),
      objActiveSet(log),
      objCodingScheme(log),
      objGPRSInformation(log),
      objGSMServingCell(log),
      objMobileAllocation(log),
      objNeighboringCells(log),
      objPDPContextList(log),
      objProcessPS(log),
      objUMTSRRMeasurement(log),
      objCellChangeCounters(log),
      objDetectedSet(log),
      objGSMSet(log),
      objNonRankedGSMSet(log),
      objProcessCO(log),
      objServingPLMN(log),
      objUMTSSet(log),
      objEquivalentPLMNList(log),
      objGSMRRInfo(log),
      objMonitoredSet(log),
      objNonRankedUMTSSet(log),
      objProcessCS(log),
      objUMTSRRInfo(log),
      objBLER(log),
      objVirtualActiveSet(log),
      objSimInfo(log),
      objHSDPAInformation(log)
{
    createSections({&objActiveSet,
                    &objCodingScheme,
                    &objGPRSInformation,
                    &objGSMServingCell,
                    &objMobileAllocation,
                    &objNeighboringCells,
                    &objPDPContextList,
                    &objProcessPS,
                    &objUMTSRRMeasurement,
                    &objCellChangeCounters,
                    &objDetectedSet,
                    &objGSMSet,
                    &objNonRankedGSMSet,
                    &objProcessCO,
                    &objServingPLMN,
                    &objUMTSSet,
                    &objEquivalentPLMNList,
                    &objGSMRRInfo,
                    &objMonitoredSet,
                    &objNonRankedUMTSSet,
                    &objProcessCS,
                    &objUMTSRRInfo,
                    &objBLER,
                    &objVirtualActiveSet,
                    &objSimInfo,
                    &objHSDPAInformation});
}

} // namespace ventrik
