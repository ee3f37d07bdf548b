#pragma once

#include "LogGenerator/Orbel/ClassIndex.h"
#include "LogGenerator/Orbel/PDPContextList.h"
#include "LogGenerator/Orbel/SimInfo.h"
#include "LogGenerator/Orbel/UTRAN/CCTRCHSIRMeasurement.h"
#include "LogGenerator/Orbel/UTRAN/RRC_State.h"
#include "LogGenerator/Orbel/UTRAN/UTRANSections.h"
#include "LogGenerator/Orbel/UTRAN/UTRANServingCellInfo.h"

namespace ventrik
{

/// The sections of the second UTRAN family, in the order in which they see a packet that several
/// want.
class UTRANClassIndex : public ClassIndex
{
  public:
    using ClassIndex::ClassIndex;

  private:
    Base& rrc_state = add<RRC_State>();
    Base& servingCellInfo = add<UTRANServingCellInfo>();
    Base& tdMeasurements = add<UTRANNeighbhorMeasurements>();
    Base& gsmMeasurements = add<GSMNeighbhorMeasurements>();
    Base& trchMeasurements = add<TRCHBLERMeasurement>();
    Base& cctrchMeasurements = add<CCTRCHSIRMeasurement>();
    Base& pdpList = add<PDPContextList>();
    Base& simInfo = add<SimInfo>();
};

} // namespace ventrik
