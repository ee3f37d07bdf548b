#pragma once

#include "Model/PlaceTable.h"

#include <string>

namespace ventrik
{

/// The names on the way to a place: "Neighbors › Neighbor Cells List › 0". Empty for the display.
std::string placeTitle(const PlaceTable& places, PlaceId place);
/// The same of a path, as panes have it.
std::string pathTitle(std::string_view path);

} // namespace ventrik
