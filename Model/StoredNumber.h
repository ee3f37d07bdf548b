#pragma once

#include "Model/ChangeStore.h"

#include <optional>
#include <string_view>

namespace ventrik
{

struct StoredNumber {
    double number;
    std::string_view unit; ///< empty where there is none; lives as long as the value's text does
};

/// The number that a value shows. Where no field shows, the text is all there is: a plain number,
/// alone or with a blank and a unit behind it.
std::optional<StoredNumber> storedNumber(const StoredValue& shown);

} // namespace ventrik
