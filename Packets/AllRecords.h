#pragma once

#include "Packets/Record.h"

namespace ventrik
{

/// The records of all technologies, in the order of their log codes.
std::span<const Record* const> allRecords();

/// The record of an effective log code, or null. A code means the same in every technology.
const Record* recordOf(std::uint32_t logCode);

} // namespace ventrik
