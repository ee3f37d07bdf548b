#pragma once

#include <cstddef>
#include <span>
#include <string_view>

namespace ventrik
{

/// The label of an enumerated value. Values past the end of the labels, and gaps among them, which
/// are empty labels, have none and give the other text.
constexpr std::string_view labelOr(std::span<const std::string_view> labels, std::size_t value,
                                   std::string_view otherwise)
{
    return value < labels.size() && !labels[value].empty() ? labels[value] : otherwise;
}

} // namespace ventrik
