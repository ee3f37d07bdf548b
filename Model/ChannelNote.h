#pragma once

#include "Model/VentrikModel.h"
#include "Platform/Clock.h"

#include <optional>
#include <string>

namespace ventrik
{

/// What the model knows of the channel and the display.
struct ChannelState {
    ChannelFault fault = ChannelFault::None;
    std::optional<Clock::TimePoint> connectedSince = {};
    std::optional<Clock::TimePoint> lastMessageTime = {};
    std::string displayFault = {};

    static ChannelState of(const VentrikModel& model);
};

/// Why the channel is down and when the panes were last brought up to date; else why there is no
/// display; else for how long nothing has come, from 10 s on.
std::string channelNote(const ChannelState& state, const Clock& clock,
                        std::optional<Clock::TimePoint> lastUpdate);

/// Why there is nothing to show, in a few words.
std::string reasonForNoData(const ChannelState& state);

/// The local time as "HH:MM:SS".
std::string timeOfDay(const Clock& clock, Clock::TimePoint time);

} // namespace ventrik
