#include "Model/StoredNumber.h"

#include <algorithm>

namespace ventrik
{

std::optional<StoredNumber> storedNumber(const StoredValue& shown)
{
    if (shown.number)
        return StoredNumber{*shown.number, shown.unit};
    if (shown.field)
        return std::nullopt;
    const std::size_t end = std::min(shown.text.find(' '), shown.text.size());
    const auto number = plainNumber(shown.text.substr(0, end));
    if (!number)
        return std::nullopt;
    return StoredNumber{*number, shown.text.substr(std::min(end + 1, shown.text.size()))};
}

} // namespace ventrik
