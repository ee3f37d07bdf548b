#pragma once

#include "LogGenerator/Orbel/GSM/EmptySet.h"

namespace ventrik
{

/// The cells that the network asked to be monitored.
class MonitoredSet : public EmptySet
{
  public:
    explicit MonitoredSet(SystemLog& log);

    std::string_view getSectionName() const override;
};

} // namespace ventrik
