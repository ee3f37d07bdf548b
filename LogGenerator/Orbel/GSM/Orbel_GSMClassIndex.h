#pragma once

#include "LogGenerator/Orbel/ClassIndex.h"
#include "LogGenerator/Orbel/GSM/ActiveSet.h"
#include "LogGenerator/Orbel/GSM/CellChangeCounters.h"
#include "LogGenerator/Orbel/GSM/CodingScheme.h"
#include "LogGenerator/Orbel/GSM/DetectedSet.h"
#include "LogGenerator/Orbel/GSM/EquivalentPLMNList.h"
#include "LogGenerator/Orbel/GSM/GSMSet.h"
#include "LogGenerator/Orbel/GSM/MonitoredSet.h"
#include "LogGenerator/Orbel/GSM/NonRankedGSMSet.h"
#include "LogGenerator/Orbel/GSM/NonRankedUMTSSet.h"
#include "LogGenerator/Orbel/GSM/ProcessCO.h"
#include "LogGenerator/Orbel/GSM/ProcessCS.h"
#include "LogGenerator/Orbel/GSM/ProcessPS.h"
#include "LogGenerator/Orbel/GSM/ServingPLMN.h"
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
    PDPContextList objPDPContextList;
    ProcessPS objProcessPS;
    CellChangeCounters objCellChangeCounters;
    DetectedSet objDetectedSet;
    GSMSet objGSMSet;
    NonRankedGSMSet objNonRankedGSMSet;
    ProcessCO objProcessCO;
    ServingPLMN objServingPLMN;
    UMTSSet objUMTSSet;
    EquivalentPLMNList objEquivalentPLMNList;
    MonitoredSet objMonitoredSet;
    NonRankedUMTSSet objNonRankedUMTSSet;
    ProcessCS objProcessCS;
    VirtualActiveSet objVirtualActiveSet;
    SimInfo objSimInfo;
};

} // namespace ventrik
