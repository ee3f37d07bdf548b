#include "LogGenerator/Orbel/UTRAN/UTRANClassIndex.h"

namespace ventrik
{

UTRANClassIndex::UTRANClassIndex(SystemLog& log)
    : ClassIndex(log),
      rrc_state(log),
      servingCellInfo(log),
      tdMeasurements(log),
      gsmMeasurements(log),
      trchMeasurements(log),
      cctrchMeasurements(log),
      pdpList(log),
      simInfo(log)
{
    createSections({&rrc_state, &servingCellInfo, &tdMeasurements, &gsmMeasurements,
                    &trchMeasurements, &cctrchMeasurements, &pdpList, &simInfo});
}

} // namespace ventrik
