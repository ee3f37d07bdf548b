#include "Charts/ChartPalette.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

namespace ventrik
{

namespace
{

using Triple = std::array<double, 3>;
using Matrix = std::array<Triple, 3>;

/// How linear red, green and blue look to the four kinds of eyes (Machado, Oliveira and Fernandes,
/// 2009, full severity).
struct Sight {
    const char* name;
    Matrix seen;
};
constexpr std::array<Sight, 4> sights{{
    {"all colors", {{{1, 0, 0}, {0, 1, 0}, {0, 0, 1}}}},
    {"no red",
     {{{0.152286, 1.052583, -0.204868},
       {0.114503, 0.786281, 0.099216},
       {-0.003882, -0.048116, 1.051998}}}},
    {"no green",
     {{{0.367322, 0.860646, -0.227968},
       {0.280085, 0.672501, 0.047413},
       {-0.011820, 0.042940, 0.968881}}}},
    {"no blue",
     {{{1.255528, -0.076749, -0.178779},
       {-0.078411, 0.930809, 0.147602},
       {0.004733, 0.691367, 0.303900}}}},
}};

double linear(std::uint8_t channel)
{
    const double share = channel / 255.0;
    return share <= 0.04045 ? share / 12.92 : std::pow((share + 0.055) / 1.055, 2.4);
}

Triple linear(Color color)
{
    return {linear(color.red), linear(color.green), linear(color.blue)};
}

Triple times(const Matrix& matrix, const Triple& vector)
{
    Triple product{};
    for (std::size_t row = 0; row < 3; ++row)
        for (std::size_t column = 0; column < 3; ++column)
            product[row] += matrix[row][column] * vector[column];
    return product;
}

// In the color space CIE L*a*b*, where a distance of about 2 can just be seen side by side.
Triple perceived(Color color, const Sight& sight)
{
    constexpr Matrix toXyz{
        {{0.4124, 0.3576, 0.1805}, {0.2126, 0.7152, 0.0722}, {0.0193, 0.1192, 0.9505}}};
    Triple seen = times(sight.seen, linear(color));
    for (double& channel : seen)
        channel = std::clamp(channel, 0.0, 1.0);
    Triple xyz = times(toXyz, seen);
    xyz[0] /= 0.9505;
    xyz[2] /= 1.089;
    for (double& each : xyz)
        each = each > 0.008856 ? std::cbrt(each) : 7.787 * each + 16.0 / 116;
    return {116 * xyz[1] - 16, 500 * (xyz[0] - xyz[1]), 200 * (xyz[1] - xyz[2])};
}

double difference(Color one, Color other, const Sight& sight)
{
    const Triple a = perceived(one, sight);
    const Triple b = perceived(other, sight);
    return std::hypot(a[0] - b[0], a[1] - b[1], a[2] - b[2]);
}

double luminance(Color color)
{
    const Triple light = linear(color);
    return 0.2126 * light[0] + 0.7152 * light[1] + 0.0722 * light[2];
}

// As WCAG defines it.
double contrast(Color one, Color other)
{
    const auto [dark, bright] = std::minmax({luminance(one), luminance(other)});
    return (bright + 0.05) / (dark + 0.05);
}

class ChartPaletteTest : public testing::TestWithParam<const ChartPalette*>
{
};

} // namespace

TEST_P(ChartPaletteTest, AllEyesTellTheBandsApart)
{
    const auto& bands = GetParam()->bands;
    for (const Sight& sight : sights)
        for (std::size_t one = 0; one < bands.size(); ++one)
            for (std::size_t other = 0; other < one; ++other)
                EXPECT_GE(difference(bands[one], bands[other], sight), 9.9)
                    << sight.name << ": " << one << " and " << other;
}

TEST_P(ChartPaletteTest, LinesShowOnEveryBand)
{
    for (const Color line : GetParam()->lines)
        for (const Color band : GetParam()->bands)
            EXPECT_GE(contrast(line, band), 3);
}

TEST_P(ChartPaletteTest, TextsCanBeRead)
{
    const ChartPalette& palette = *GetParam();
    EXPECT_GE(contrast(palette.text, palette.background), 7);
    EXPECT_GE(contrast(palette.faintText, palette.background), 4.5);
    EXPECT_GE(contrast(palette.tagText, palette.cursor), 4.5);
    EXPECT_GE(contrast(palette.tagText, palette.secondCursor), 4.5);
    for (const Color line : palette.lines)
        EXPECT_GE(contrast(line, palette.background), 4.5);
}

INSTANTIATE_TEST_SUITE_P(Palettes, ChartPaletteTest, testing::Values(&lightPalette, &darkPalette));

} // namespace ventrik
