#pragma once

#include "Platform/Technology.h"
#include "TelephonyService/MessageSource.h"

#include <cstdint>
#include <string>

namespace ventrik
{

/// Writes the first messages of a source as a capture that begins at a fixed time, so that the same
/// scenario always gives the same file. On failure `error` says why in one line.
bool writeScenarioCapture(MessageSource& source, std::uint64_t messageCount,
                          const Technology& technology, const std::string& path,
                          std::string& error);

} // namespace ventrik
