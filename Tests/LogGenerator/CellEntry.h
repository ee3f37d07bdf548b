#pragma once

#include "Platform/TelephonyConstants.h"
#include "PropertyList/PlistValue.h"

#include <string_view>

namespace ventrik
{

/// A cell as the cell monitor tells it, without any number.
inline PlistDictionary cellEntry(std::string_view technology, std::string_view type)
{
    return {{kQXCellMonitorCellRadioAccessTechnology, technology}, {kQXCellMonitorCellType, type}};
}

} // namespace ventrik
