#pragma once

#include <string_view>

namespace ventrik
{

// How a display object shows: what the tree and whoever else tells of its values agree on.

/// A dictionary with this key shows its others in their order; the key itself does not show.
inline constexpr std::string_view sortedMarker = "_sorted";
/// In the place of a value that is no text.
inline constexpr std::string_view notText = "(unknown)";

/// Whether a text stands for nothing, as those of templates do until something comes.
constexpr bool isPlaceholder(std::string_view text)
{
    return text.empty() || text == "-" || text == "N/A";
}

/// What a key of a dictionary that is in order shows as: "order;label" as its label.
std::string_view labelOfSortedKey(std::string_view key);

} // namespace ventrik
