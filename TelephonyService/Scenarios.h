#pragma once

#include "Packets/Layouts.h"
#include "Platform/Technology.h"
#include "TelephonyService/MessageSource.h"

#include <cstdint>
#include <memory>

namespace ventrik
{

/// The built-in scenario of a technology; none where there is no such scenario. The same world in
/// records of the base layouts, of newer ones, or with those that have no base layout.
std::unique_ptr<MessageSource> makeScenario(const Technology& technology, std::uint32_t seed,
                                            RecordsMode records = RecordsMode::Base);

} // namespace ventrik
