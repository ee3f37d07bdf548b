#pragma once

#include "Model/EventLog.h"
#include "Platform/Clock.h"

#include <chrono>
#include <cstddef>
#include <functional>
#include <map>
#include <utility>
#include <vector>

namespace ventrik
{

class Notices;

/// Tells whoever does not look at the window of alerts that fired: by the bell and a notice for all
/// that fire together, once in ten seconds at most for each alert.
class AlertTeller
{
  public:
    static constexpr std::chrono::seconds quietTime{10};

    /// Both outlive it; the notices may be null.
    AlertTeller(const Clock& clock, Notices* notices, std::function<void()> ring)
        : _clock(clock), _notices(notices), _ring(std::move(ring))
    {
    }

    void tell(const std::vector<Event>& events);

  private:
    bool mayTell(std::size_t alert);

    const Clock& _clock;
    Notices* _notices;
    std::function<void()> _ring;
    std::map<std::size_t, Clock::TimePoint> _told; // by alert
};

} // namespace ventrik
