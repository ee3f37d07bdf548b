#pragma once

#include "LogGenerator/Orbel/GSM/PlaceholderSection.h"

namespace ventrik
{

/// The place of the UMTS cells that the baseband does not rank.
class NonRankedUMTSSet : public PlaceholderSection
{
  public:
    explicit NonRankedUMTSSet(SystemLog& log);

    std::string_view getSectionName() const override;
};

} // namespace ventrik
