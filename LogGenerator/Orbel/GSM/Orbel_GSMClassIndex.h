#pragma once

#include "LogGenerator/Orbel/ClassIndex.h"

namespace ventrik
{

/// The sections of the GSM/UMTS family.
class Orbel_GSMClassIndex : public ClassIndex
{
  public:
    explicit Orbel_GSMClassIndex(SystemLog& log);
};

} // namespace ventrik
