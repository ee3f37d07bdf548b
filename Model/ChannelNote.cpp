#include "Model/ChannelNote.h"

#include <algorithm>
#include <chrono>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

constexpr auto longSilence = 10s;

std::string silenceNote(const ChannelState& state, Clock::TimePoint now)
{
    if (!state.connectedSince)
        return {};
    const auto heard =
        std::max(*state.connectedSince, state.lastMessageTime.value_or(*state.connectedSince));
    const auto silence = std::chrono::floor<std::chrono::seconds>(now - heard);
    return silence < longSilence ? std::string() : fmt::format("no data for {} s", silence.count());
}

} // namespace

ChannelState ChannelState::of(const VentrikModel& model)
{
    return {model.channelFault(), model.connectedSince(), model.lastMessageTime(),
            model.displayFault()};
}

std::string channelNote(const ChannelState& state, const Clock& clock,
                        std::optional<Clock::TimePoint> lastUpdate)
{
    const std::string fault(channelFaultText(state.fault));
    if (!fault.empty())
        return lastUpdate ? fmt::format("last update {} · {}", timeOfDay(clock, *lastUpdate), fault)
                          : fault;
    return state.displayFault.empty() ? silenceNote(state, clock.now()) : state.displayFault;
}

std::string reasonForNoData(const ChannelState& state)
{
    std::string reason = state.displayFault;
    if (reason.empty())
        reason = channelFaultText(state.fault);
    if (reason.empty())
        return "No data yet";
    // All of these begin with a letter of the basic alphabet or with a file's name.
    if (reason.front() >= 'a' && reason.front() <= 'z')
        reason.front() = static_cast<char>(reason.front() - 'a' + 'A');
    return reason;
}

std::string timeOfDay(const Clock& clock, Clock::TimePoint time)
{
    const auto local =
        time.time_since_epoch() + std::chrono::seconds(clock.timeZone(time).secondsFromUtc);
    const auto sinceMidnight = std::chrono::floor<std::chrono::seconds>(
        local - std::chrono::floor<std::chrono::days>(local));
    const std::chrono::hh_mm_ss parts(sinceMidnight);
    return fmt::format("{:02}:{:02}:{:02}", parts.hours().count(), parts.minutes().count(),
                       parts.seconds().count());
}

} // namespace ventrik
