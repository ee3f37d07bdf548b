#include "LogGenerator/Orbel/UTRAN/UTRANClassIndex.h"

namespace ventrik
{

UTRANClassIndex::UTRANClassIndex(SystemLog& log) : ClassIndex(log)
{
    createSections({});
}

} // namespace ventrik
