#pragma once

#include "Platform/Clock.h"

#include <string>

namespace ventrik
{

/// A moment as the history and the snapshot file write it: 2026-11-16 06:10:28 +0000, always in UTC
/// so that entries from different machines can be laid side by side.
std::string dateText(Clock::TimePoint time);

} // namespace ventrik
