#include "LogGenerator/Orbel/GSM/Orbel_GSMClassIndex.h"

namespace ventrik
{

Orbel_GSMClassIndex::Orbel_GSMClassIndex(SystemLog& log) : ClassIndex(log)
{
    createSections({});
}

} // namespace ventrik
