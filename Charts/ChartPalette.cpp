#include "Charts/ChartPalette.h"

namespace ventrik
{

const ChartPalette lightPalette{
    .background = rgb(0xffffff),
    .text = rgb(0x1a1a1a),
    .faintText = rgb(0x5a5a5a),
    .grid = {0, 0, 0, 28},
    .frame = {0, 0, 0, 90},
    .mark = rgb(0x5a5a5a),
    .cursor = rgb(0x1a1a1a),
    .secondCursor = rgb(0x8a1c5b),
    .tagText = rgb(0xffffff),
    .bands = {rgb(0xb9cdf2), rgb(0xd8f3d0), rgb(0xfdf3b8), rgb(0xf5b79f)},
    .lines = {rgb(0x0b5394), rgb(0xa33f00), rgb(0x00604a), rgb(0x7a2f74), rgb(0x222222),
              rgb(0x6b5300)},
};

const ChartPalette darkPalette{
    .background = rgb(0x1e1e1e),
    .text = rgb(0xf0f0f0),
    .faintText = rgb(0xb4b4b4),
    .grid = {255, 255, 255, 30},
    .frame = {255, 255, 255, 90},
    .mark = rgb(0xb4b4b4),
    .cursor = rgb(0xf0f0f0),
    .secondCursor = rgb(0xffb3dc),
    .tagText = rgb(0x1a1a1a),
    .bands = {rgb(0x1b2f5c), rgb(0x1c4a2c), rgb(0x5f5614), rgb(0x5c2418)},
    .lines = {rgb(0x7cc4ff), rgb(0xffa45c), rgb(0x5fd6ae), rgb(0xe8a3dc), rgb(0xf2f2f2),
              rgb(0xe8d44d)},
};

} // namespace ventrik
