#pragma once

#include "LogGenerator/Orbel/ClassIndex.h"
#include "LogGenerator/Orbel/GSM/ActiveSet.h"
#include "LogGenerator/Orbel/GSM/BLER.h"
#include "LogGenerator/Orbel/GSM/CellChangeCounters.h"
#include "LogGenerator/Orbel/GSM/CodingScheme.h"
#include "LogGenerator/Orbel/GSM/DetectedSet.h"
#include "LogGenerator/Orbel/GSM/EquivalentPLMNList.h"
#include "LogGenerator/Orbel/GSM/GPRSInformation.h"
#include "LogGenerator/Orbel/GSM/GSMRRInfo.h"
#include "LogGenerator/Orbel/GSM/GSMServingCell.h"
#include "LogGenerator/Orbel/GSM/GSMSet.h"
#include "LogGenerator/Orbel/GSM/HSDPAInformation.h"
#include "LogGenerator/Orbel/GSM/MobileAllocation.h"
#include "LogGenerator/Orbel/GSM/MonitoredSet.h"
#include "LogGenerator/Orbel/GSM/NeighboringCells.h"
#include "LogGenerator/Orbel/GSM/NonRankedGSMSet.h"
#include "LogGenerator/Orbel/GSM/NonRankedUMTSSet.h"
#include "LogGenerator/Orbel/GSM/ProcessCO.h"
#include "LogGenerator/Orbel/GSM/ProcessCS.h"
#include "LogGenerator/Orbel/GSM/ProcessPS.h"
#include "LogGenerator/Orbel/GSM/ServingPLMN.h"
#include "LogGenerator/Orbel/GSM/UMTSRRInfo.h"
#include "LogGenerator/Orbel/GSM/UMTSRRMeasurement.h"
#include "LogGenerator/Orbel/GSM/UMTSSet.h"
#include "LogGenerator/Orbel/GSM/VirtualActiveSet.h"
#include "LogGenerator/Orbel/PDPContextList.h"
#include "LogGenerator/Orbel/SimInfo.h"

namespace ventrik
{

/// The sections of the GSM/UMTS family, in the order in which they see a packet that several want.
class Orbel_GSMClassIndex : public ClassIndex
{
  public:
    explicit Orbel_GSMClassIndex(SystemLog& log);

  private:
    ActiveSet objActiveSet;
    CodingScheme objCodingScheme;
    GPRSInformation objGPRSInformation;
    GSMServingCell objGSMServingCell;
    MobileAllocation objMobileAllocation;
    NeighboringCells objNeighboringCells;
    PDPContextList objPDPContextList;
    ProcessPS objProcessPS;
    UMTSRRMeasurement objUMTSRRMeasurement;
    CellChangeCounters objCellChangeCounters;
    DetectedSet objDetectedSet;
    GSMSet objGSMSet;
    NonRankedGSMSet objNonRankedGSMSet;
    ProcessCO objProcessCO;
    ServingPLMN objServingPLMN;
    UMTSSet objUMTSSet;
    EquivalentPLMNList objEquivalentPLMNList;
    GSMRRInfo objGSMRRInfo;
    MonitoredSet objMonitoredSet;
    NonRankedUMTSSet objNonRankedUMTSSet;
    ProcessCS objProcessCS;
    UMTSRRInfo objUMTSRRInfo;
    BLER objBLER;
    VirtualActiveSet objVirtualActiveSet;
    SimInfo objSimInfo;
    HSDPAInformation objHSDPAInformation;
};

} // namespace ventrik
