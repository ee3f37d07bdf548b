#pragma once

#include "Charts/Canvas.h"

#include <array>

namespace ventrik
{

/// The colors of a chart. Bands and lines stay apart also for eyes that do not tell red from green
/// or blue from yellow, and a line shows on every band.
struct ChartPalette {
    Color background;
    Color text;
    Color faintText;
    Color grid;
    Color frame;
    Color mark;
    Color cursor;
    Color secondCursor;
    Color tagText;              ///< on the cursors' colors
    std::array<Color, 4> bands; ///< by Quality
    std::array<Color, 6> lines;
};

extern const ChartPalette lightPalette; ///< for print as well
extern const ChartPalette darkPalette;

} // namespace ventrik
