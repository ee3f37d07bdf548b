#pragma once

#include "PropertyList/PlistValue.h"

#include <string>
#include <vector>

namespace ventrik
{

/// "path: value" for each text of a display that the template has not put there, sorted.
std::vector<std::string> displayTexts(const PlistValue& display);

} // namespace ventrik
