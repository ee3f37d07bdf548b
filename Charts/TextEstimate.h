#pragma once

#include "Charts/Canvas.h"

#include <string>
#include <string_view>

namespace ventrik
{

/// About how wide a text is in whatever sans-serif font it will be shown in; rather too wide than
/// too narrow.
class TextEstimate : public TextMeasure
{
  public:
    double textWidth(std::string_view text, double size, bool isBold = false) const override;
};

/// The text as it is where it fits into the width, else its start and an ellipsis. Empty where not
/// even one character fits.
std::string elided(std::string_view text, double width, double size, bool isBold,
                   const TextMeasure& measure);

} // namespace ventrik
