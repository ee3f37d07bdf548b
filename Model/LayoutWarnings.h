#pragma once

#include "Packets/Layouts.h"

#include <span>
#include <string>
#include <vector>

namespace ventrik
{

/// What the screens say of records that were read without their layout being known: a line each.
/// There are three at most: the third counts the others.
std::vector<std::string> layoutWarnings(std::span<const ReadLayout> layouts);

} // namespace ventrik
