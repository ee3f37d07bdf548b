#include "App/AlertTeller.h"

#include "Platform/Notices.h"

#include <string>

namespace ventrik
{

void AlertTeller::tell(const std::vector<Event>& events)
{
    std::string text;
    for (const Event& event : events)
        if (event.alert && mayTell(*event.alert))
            text += (text.empty() ? "" : ", ") + event.text;
    if (text.empty())
        return;
    if (_notices)
        _notices->post(text);
    if (_ring)
        _ring();
}

// A clock that was set back is no reason for silence.
bool AlertTeller::mayTell(std::size_t alert)
{
    const Clock::TimePoint now = _clock.now();
    const auto [told, isFirst] = _told.emplace(alert, now);
    if (!isFirst && now >= told->second && now - told->second < quietTime)
        return false;
    told->second = now;
    return true;
}

} // namespace ventrik
