#include "LogGenerator/C2K/BandClass.h"

#include "LogGenerator/Orbel/Labels.h"

#include <array>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

// The blank that is missing in class 9 is missed by nobody who searches for the label.
constexpr std::array<std::string_view, 13> bandClassLabels{"800 MHz cellular band [0]",
                                                           "1.8 to 2.0GHz PCS band [1]",
                                                           "872 to 960MHz TACS band [2]",
                                                           "832 to 925MHz JTACS band [3]",
                                                           "1.75 to 1.87GHz Korean PCS band [4]",
                                                           "450MHz band [5]",
                                                           "2GHz band [6]",
                                                           "700MHz band [7]",
                                                           "1800 MHz band [8]",
                                                           "900 MHzband [9]",
                                                           "Secondary 800 MHz band [10]",
                                                           "400 MHz European PAMR band [11]",
                                                           "800 MHz European PAMR band [12]"};

} // namespace

std::string bandClassLabel(std::uint8_t bandClass)
{
    return std::string(
        labelOr(bandClassLabels, bandClass, fmt::format("[Bad Value {}]", bandClass)));
}

} // namespace ventrik
