#pragma once

#include "LogGenerator/Orbel/ClassIndex.h"

namespace ventrik
{

/// The sections of the second UTRAN family.
class UTRANClassIndex : public ClassIndex
{
  public:
    explicit UTRANClassIndex(SystemLog& log);
};

} // namespace ventrik
