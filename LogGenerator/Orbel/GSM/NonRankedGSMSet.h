#pragma once

#include "LogGenerator/Orbel/GSM/PlaceholderSection.h"

namespace ventrik
{

/// The place of the GSM cells that the baseband does not rank.
class NonRankedGSMSet : public PlaceholderSection
{
  public:
    explicit NonRankedGSMSet(SystemLog& log);

    std::string_view getSectionName() const override;
};

} // namespace ventrik
