#pragma once

#include "LogGenerator/Orbel/ClassIndex.h"
#include "LogGenerator/Orbel/PDPContextList.h"
#include "LogGenerator/Orbel/SimInfo.h"
#include "LogGenerator/Orbel/UTRAN/CCTRCHSIRMeasurement.h"
#include "LogGenerator/Orbel/UTRAN/GSMNeighbhorMeasurements.h"
#include "LogGenerator/Orbel/UTRAN/RRC_State.h"
#include "LogGenerator/Orbel/UTRAN/TRCHBLERMeasurement.h"
#include "LogGenerator/Orbel/UTRAN/UTRANNeighbhorMeasurements.h"
#include "LogGenerator/Orbel/UTRAN/UTRANServingCellInfo.h"

namespace ventrik
{

/// The sections of the second UTRAN family, in the order in which they see a packet that several
/// want.
class UTRANClassIndex : public ClassIndex
{
  public:
    explicit UTRANClassIndex(SystemLog& log);

  private:
    RRC_State rrc_state;
    UTRANServingCellInfo servingCellInfo;
    UTRANNeighbhorMeasurements tdMeasurements;
    GSMNeighbhorMeasurements gsmMeasurements;
    TRCHBLERMeasurement trchMeasurements;
    CCTRCHSIRMeasurement cctrchMeasurements;
    PDPContextList pdpList;
    SimInfo simInfo;
};

} // namespace ventrik
