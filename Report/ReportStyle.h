#pragma once

#include <string_view>

namespace ventrik
{

/// The style sheet of a report: light and dark as the reader has it, light on paper.
extern const std::string_view reportStyle;

} // namespace ventrik
