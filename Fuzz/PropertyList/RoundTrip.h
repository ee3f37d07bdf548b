#pragma once

#include "PropertyList/PropertyListReader.h"

namespace ventrik
{

/// Ends the program when a reading is neither a value nor a one-line error, or when its value, if
/// it can be written, does not read back equal. Dates are written to whole seconds and compare so.
void checkReading(const PropertyListReading& reading);

} // namespace ventrik
