#include "LogGenerator/Orbel/GSM/Orbel_GSMClassIndex.h"

namespace ventrik
{

Orbel_GSMClassIndex::Orbel_GSMClassIndex(SystemLog& log)
    : ClassIndex(log),
      objActiveSet(log),
      objCodingScheme(log),
      objPDPContextList(log),
      objProcessPS(log),
      objCellChangeCounters(log),
      objDetectedSet(log),
      objGSMSet(log),
      objNonRankedGSMSet(log),
      objProcessCO(log),
      objServingPLMN(log),
      objUMTSSet(log),
      objEquivalentPLMNList(log),
      objMonitoredSet(log),
      objNonRankedUMTSSet(log),
      objProcessCS(log),
      objVirtualActiveSet(log),
      objSimInfo(log)
{
    createSections({&objActiveSet, &objCodingScheme, &objPDPContextList, &objProcessPS,
                    &objCellChangeCounters, &objDetectedSet, &objGSMSet, &objNonRankedGSMSet,
                    &objProcessCO, &objServingPLMN, &objUMTSSet, &objEquivalentPLMNList,
                    &objMonitoredSet, &objNonRankedUMTSSet, &objProcessCS, &objVirtualActiveSet,
                    &objSimInfo});
}

} // namespace ventrik
