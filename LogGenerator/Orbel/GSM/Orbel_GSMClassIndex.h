#pragma once

#include "LogGenerator/Orbel/ClassIndex.h"
#include "LogGenerator/Orbel/GSM/ActiveSet.h"
#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "LogGenerator/Orbel/GSM/NeighboringCells.h"
#include "LogGenerator/Orbel/GSM/UMTSRRInfo.h"
#include "LogGenerator/Orbel/PDPContextList.h"
#include "LogGenerator/Orbel/SimInfo.h"

namespace ventrik
{

/// The sections of the GSM/UMTS family, in the order in which they see a packet that several want.
class Orbel_GSMClassIndex : public ClassIndex
{
  public:
    using ClassIndex::ClassIndex;

  private:
    Base& objActiveSet = add<ActiveSet>();
    Base& objCodingScheme = add<CodingScheme>();
    Base& objGPRSInformation = add<GPRSInformation>();
    Base& objGSMServingCell = add<GSMServingCell>();
    Base& objMobileAllocation = add<MobileAllocation>();
    Base& objNeighboringCells = add<NeighboringCells>();
    Base& objPDPContextList = add<PDPContextList>();
    Base& objProcessPS = add<ProcessPS>();
    Base& objUMTSRRMeasurement = add<UMTSRRMeasurement>();
    Base& objCellChangeCounters = add<CellChangeCounters>();
    Base& objDetectedSet = add<DetectedSet>();
    Base& objGSMSet = add<GSMSet>();
    Base& objNonRankedGSMSet = add<NonRankedGSMSet>();
    Base& objProcessCO = add<ProcessCO>();
    Base& objServingPLMN = add<ServingPLMN>();
    Base& objUMTSSet = add<UMTSSet>();
    Base& objEquivalentPLMNList = add<EquivalentPLMNList>();
    Base& objGSMRRInfo = add<GSMRRInfo>();
    Base& objMonitoredSet = add<MonitoredSet>();
    Base& objNonRankedUMTSSet = add<NonRankedUMTSSet>();
    Base& objProcessCS = add<ProcessCS>();
    Base& objUMTSRRInfo = add<UMTSRRInfo>();
    Base& objBLER = add<BLER>();
    Base& objVirtualActiveSet = add<VirtualActiveSet>();
    Base& objSimInfo = add<SimInfo>();
    Base& objHSDPAInformation = add<HSDPAInformation>();
};

} // namespace ventrik
