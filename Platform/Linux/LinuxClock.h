#pragma once

#include "Platform/Clock.h"

namespace ventrik
{

/// The system's clock and local time zone.
class LinuxClock : public Clock
{
  public:
    TimePoint now() const override;
    TimeZone timeZone(TimePoint time) const override;
};

} // namespace ventrik
