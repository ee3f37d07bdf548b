#include "Charts/Canvas.h"

#include <array>

namespace ventrik
{

std::span<const double> dashLengths(Dash dash)
{
    static constexpr std::array dashed{5.0, 3.0};
    static constexpr std::array dotted{1.2, 2.2};
    static constexpr std::array dashDotted{7.0, 2.5, 1.5, 2.5};
    switch (dash) {
    case Dash::Dashed:
        return dashed;
    case Dash::Dotted:
        return dotted;
    case Dash::DashDotted:
        return dashDotted;
    case Dash::Solid:
        break;
    }
    return {};
}

} // namespace ventrik
