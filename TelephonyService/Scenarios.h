#pragma once

#include "Platform/Technology.h"
#include "TelephonyService/MessageSource.h"

#include <cstdint>
#include <memory>

namespace ventrik
{

/// The built-in scenario of a technology; none where there is no such scenario.
std::unique_ptr<MessageSource> makeScenario(const Technology& technology, std::uint32_t seed);

} // namespace ventrik
