#pragma once

#include "LogGenerator/Orbel/GSM/EmptySet.h"

namespace ventrik
{

/// The cells that were detected without having been announced.
class DetectedSet : public EmptySet
{
  public:
    explicit DetectedSet(SystemLog& log);

    std::string_view getSectionName() const override;
};

} // namespace ventrik
