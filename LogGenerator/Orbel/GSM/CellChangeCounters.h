#pragma once

#include "LogGenerator/Orbel/GSM/PlaceholderSection.h"

namespace ventrik
{

/// The place of the cell change counters.
class CellChangeCounters : public PlaceholderSection
{
  public:
    explicit CellChangeCounters(SystemLog& log);

    std::string_view getSectionName() const override;
};

} // namespace ventrik
