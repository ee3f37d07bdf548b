#include "Packets/ChannelNumbers.h"

#include <gtest/gtest.h>

#include <limits>
#include <vector>

namespace ventrik
{

namespace
{

/// A band as the standards draw it: from its first to behind its last channel.
struct Band {
    std::string_view name;
    std::int64_t first;
    std::int64_t last;
    double low;  // MHz
    double high; // MHz, where the channels end
};

constexpr double lteStep = 0.1;

void expectChannel(const ChannelFrequency& channel, std::string_view band, double megahertz)
{
    EXPECT_EQ(channel.band, band);
    ASSERT_TRUE(channel.megahertz) << band;
    EXPECT_NEAR(*channel.megahertz, megahertz, 1e-6) << band;
}

using Lookup = ChannelFrequency (*)(std::int64_t);

// The last channel is one step below the band's end.
void expectLTEBands(Lookup lookUp, const std::vector<Band>& bands)
{
    for (const Band& band : bands) {
        expectChannel(lookUp(band.first), band.name, band.low);
        expectChannel(lookUp(band.last), band.name, band.high - lteStep);
        EXPECT_NE(lookUp(band.first - 1).band, band.name);
        EXPECT_NE(lookUp(band.last + 1).band, band.name);
    }
}

// Of UMTS both ends are those of the first and the last channel.
void expectChannelBands(Lookup lookUp, const std::vector<Band>& bands)
{
    for (const Band& band : bands) {
        expectChannel(lookUp(band.first), band.name, band.low);
        expectChannel(lookUp(band.last), band.name, band.high);
        EXPECT_NE(lookUp(band.first - 1).band, band.name);
        EXPECT_NE(lookUp(band.last + 1).band, band.name);
    }
}

ChannelFrequency ofARFCN(std::int64_t number)
{
    return downlinkOfARFCN(number);
}

const std::vector<Band> timeDivided{
    {"B33", 36000, 36199, 1900, 1920},   {"B34", 36200, 36349, 2010, 2025},
    {"B35", 36350, 36949, 1850, 1910},   {"B36", 36950, 37549, 1930, 1990},
    {"B37", 37550, 37749, 1910, 1930},   {"B38", 37750, 38249, 2570, 2620},
    {"B39", 38250, 38649, 1880, 1920},   {"B40", 38650, 39649, 2300, 2400},
    {"B41", 39650, 41589, 2496, 2690},   {"B42", 41590, 43589, 3400, 3600},
    {"B43", 43590, 45589, 3600, 3800},   {"B44", 45590, 46589, 703, 803},
    {"B45", 46590, 46789, 1447, 1467},   {"B46", 46790, 54539, 5150, 5925},
    {"B47", 54540, 55239, 5855, 5925},   {"B48", 55240, 56739, 3550, 3700},
    {"B49", 56740, 58239, 3550, 3700},   {"B50", 58240, 59089, 1432, 1517},
    {"B51", 59090, 59139, 1427, 1432},   {"B52", 59140, 60139, 3300, 3400},
    {"B53", 60140, 60254, 2483.5, 2495}, {"B54", 60255, 60304, 1670, 1675},
};

} // namespace

TEST(ChannelNumbers, AnEARFCNCountsTenthsOfAMegahertzFromItsBandsStart)
{
    expectChannel(downlinkOfEARFCN(1300), "B3", 1815);     // 1805 + 0.1 (1300 - 1200)
    expectChannel(downlinkOfEARFCN(3050), "B7", 2650);     // 2620 + 0.1 (3050 - 2750)
    expectChannel(downlinkOfEARFCN(6300), "B20", 806);     // 791 + 0.1 (6300 - 6150)
    expectChannel(downlinkOfEARFCN(9435), "B28", 780.5);   // 758 + 0.1 (9435 - 9210)
    expectChannel(downlinkOfEARFCN(39151), "B40", 2350.1); // 2300 + 0.1 (39151 - 38650)
    expectChannel(uplinkOfEARFCN(19300), "B3", 1720);      // 1710 + 0.1 (19300 - 19200)
    expectChannel(uplinkOfEARFCN(21050), "B7", 2530);      // 2500 + 0.1 (21050 - 20750)
}

TEST(ChannelNumbers, LTEDownlinksHaveTheBoundsOfTheirBands)
{
    expectLTEBands(downlinkOfEARFCN,
                   {
                       {"B1", 0, 599, 2110, 2170},          {"B2", 600, 1199, 1930, 1990},
                       {"B3", 1200, 1949, 1805, 1880},      {"B4", 1950, 2399, 2110, 2155},
                       {"B5", 2400, 2649, 869, 894},        {"B6", 2650, 2749, 875, 885},
                       {"B7", 2750, 3449, 2620, 2690},      {"B8", 3450, 3799, 925, 960},
                       {"B9", 3800, 4149, 1844.9, 1879.9},  {"B10", 4150, 4749, 2110, 2170},
                       {"B11", 4750, 4949, 1475.9, 1495.9}, {"B12", 5010, 5179, 729, 746},
                       {"B13", 5180, 5279, 746, 756},       {"B14", 5280, 5379, 758, 768},
                       {"B17", 5730, 5849, 734, 746},       {"B18", 5850, 5999, 860, 875},
                       {"B19", 6000, 6149, 875, 890},       {"B20", 6150, 6449, 791, 821},
                       {"B21", 6450, 6599, 1495.9, 1510.9}, {"B22", 6600, 7399, 3510, 3590},
                       {"B23", 7500, 7699, 2180, 2200},     {"B24", 7700, 8039, 1525, 1559},
                       {"B25", 8040, 8689, 1930, 1995},     {"B26", 8690, 9039, 859, 894},
                       {"B27", 9040, 9209, 852, 869},       {"B28", 9210, 9659, 758, 803},
                       {"B29", 9660, 9769, 717, 728},       {"B30", 9770, 9869, 2350, 2360},
                       {"B31", 9870, 9919, 462.5, 467.5},   {"B32", 9920, 10359, 1452, 1496},
                       {"B65", 65536, 66435, 2110, 2200},   {"B66", 66436, 67335, 2110, 2200},
                       {"B67", 67336, 67535, 738, 758},     {"B68", 67536, 67835, 753, 783},
                       {"B69", 67836, 68335, 2570, 2620},   {"B70", 68336, 68585, 1995, 2020},
                       {"B71", 68586, 68935, 617, 652},     {"B72", 68936, 68985, 461, 466},
                       {"B73", 68986, 69035, 460, 465},     {"B74", 69036, 69465, 1475, 1518},
                       {"B75", 69466, 70315, 1432, 1517},   {"B76", 70316, 70365, 1427, 1432},
                       {"B85", 70366, 70545, 728, 746},     {"B87", 70546, 70595, 420, 425},
                       {"B88", 70596, 70645, 422, 427},     {"B103", 70646, 70655, 757, 758},
                   });
}

TEST(ChannelNumbers, LTEUplinksHaveTheBoundsOfTheirBands)
{
    expectLTEBands(uplinkOfEARFCN,
                   {
                       {"B1", 18000, 18599, 1920, 1980},      {"B2", 18600, 19199, 1850, 1910},
                       {"B3", 19200, 19949, 1710, 1785},      {"B4", 19950, 20399, 1710, 1755},
                       {"B5", 20400, 20649, 824, 849},        {"B6", 20650, 20749, 830, 840},
                       {"B7", 20750, 21449, 2500, 2570},      {"B8", 21450, 21799, 880, 915},
                       {"B9", 21800, 22149, 1749.9, 1784.9},  {"B10", 22150, 22749, 1710, 1770},
                       {"B11", 22750, 22949, 1427.9, 1447.9}, {"B12", 23010, 23179, 699, 716},
                       {"B13", 23180, 23279, 777, 787},       {"B14", 23280, 23379, 788, 798},
                       {"B17", 23730, 23849, 704, 716},       {"B18", 23850, 23999, 815, 830},
                       {"B19", 24000, 24149, 830, 845},       {"B20", 24150, 24449, 832, 862},
                       {"B21", 24450, 24599, 1447.9, 1462.9}, {"B22", 24600, 25399, 3410, 3490},
                       {"B23", 25500, 25699, 2000, 2020},     {"B24", 25700, 26039, 1626.5, 1660.5},
                       {"B25", 26040, 26689, 1850, 1915},     {"B26", 26690, 27039, 814, 849},
                       {"B27", 27040, 27209, 807, 824},       {"B28", 27210, 27659, 703, 748},
                       {"B30", 27660, 27759, 2305, 2315},     {"B31", 27760, 27809, 452.5, 457.5},
                       {"B65", 131072, 131971, 1920, 2010},   {"B66", 131972, 132671, 1710, 1780},
                       {"B68", 132672, 132971, 698, 728},     {"B70", 132972, 133121, 1695, 1710},
                       {"B71", 133122, 133471, 663, 698},     {"B72", 133472, 133521, 451, 456},
                       {"B73", 133522, 133571, 450, 455},     {"B74", 133572, 134001, 1427, 1470},
                       {"B85", 134002, 134181, 698, 716},     {"B87", 134182, 134231, 410, 415},
                       {"B88", 134232, 134281, 412, 417},     {"B103", 134282, 134291, 787, 788},
                       {"B106", 134292, 134341, 896, 901},
                   });
}

TEST(ChannelNumbers, LTEBandsOfOneFrequencyHaveOneNumberForBothDirections)
{
    expectLTEBands(downlinkOfEARFCN, timeDivided);
    expectLTEBands(uplinkOfEARFCN, timeDivided);
}

TEST(ChannelNumbers, AnEARFCNOfNoBandHasNoFrequency)
{
    for (const std::int64_t number : {-1, 5000, 18000, 65535, 73336}) {
        EXPECT_EQ(downlinkOfEARFCN(number).band, "") << number;
        EXPECT_FALSE(downlinkOfEARFCN(number).megahertz) << number;
        EXPECT_FALSE(isDownlinkEARFCN(static_cast<double>(number))) << number;
    }
    EXPECT_FALSE(uplinkOfEARFCN(1300).megahertz);
}

TEST(ChannelNumbers, AnEARFCNMayBeOfABandWhoseFrequencyIsNotKnown)
{
    EXPECT_TRUE(isDownlinkEARFCN(70656));
    EXPECT_FALSE(downlinkOfEARFCN(70656).megahertz);
}

TEST(ChannelNumbers, WhatIsNoNumberIsOfNoBand)
{
    EXPECT_FALSE(isDownlinkEARFCN(std::numeric_limits<double>::quiet_NaN()));
    EXPECT_FALSE(isUplinkEARFCN(std::numeric_limits<double>::quiet_NaN()));
}

TEST(ChannelNumbers, AUARFCNCountsFifthsOfAMegahertz)
{
    expectChannel(downlinkOfUARFCN(10738), "I", 2147.6);      // 10738 / 5
    expectChannel(downlinkOfUARFCN(3000), "VIII", 940);       // 3000 / 5 + 340
    expectChannel(downlinkOfUARFCN(1662), "IV", 2137.4);      // 1662 / 5 + 1805
    expectChannel(downlinkOfUARFCN(4600), "XX", 811);         // 4600 / 5 - 109
    expectChannel(timeDividedUARFCN(9500), "TDD f", 1900);    // 9500 / 5
    expectChannel(timeDividedUARFCN(10062), "TDD a", 2012.4); // 10062 / 5
}

TEST(ChannelNumbers, UMTSDownlinksHaveTheBoundsOfTheirBands)
{
    expectChannelBands(
        downlinkOfUARFCN,
        {
            {"I", 10562, 10838, 2112.4, 2167.6},  {"II", 9662, 9938, 1932.4, 1987.6},
            {"III", 1162, 1513, 1807.4, 1877.6},  {"IV", 1537, 1738, 2112.4, 2152.6},
            {"V", 4357, 4458, 871.4, 891.6},      {"VII", 2237, 2563, 2622.4, 2687.6},
            {"VIII", 2937, 3088, 927.4, 957.6},   {"IX", 9237, 9387, 1847.4, 1877.4},
            {"X", 3112, 3388, 2112.4, 2167.6},    {"XI", 3712, 3787, 1478.4, 1493.4},
            {"XII", 3842, 3903, 731.4, 743.6},    {"XIII", 4017, 4043, 748.4, 753.6},
            {"XIV", 4117, 4143, 760.4, 765.6},    {"XIX", 712, 763, 877.4, 887.6},
            {"XX", 4512, 4638, 793.4, 818.6},     {"XXI", 862, 912, 1498.4, 1508.4},
            {"XXII", 4662, 5038, 3512.4, 3587.6}, {"XXV", 5112, 5413, 1932.4, 1992.6},
            {"XXVI", 5762, 5913, 861.4, 891.6},
        });
    expectChannelBands(timeDividedUARFCN, {
                                              {"TDD a", 10054, 10121, 2010.8, 2024.2},
                                              {"TDD d", 12854, 13096, 2570.8, 2619.2},
                                              {"TDD e", 11504, 11996, 2300.8, 2399.2},
                                              {"TDD f", 9404, 9596, 1880.8, 1919.2},
                                          });
}

TEST(ChannelNumbers, AdditionalUMTSChannelsLieBetweenThoseOfTheRaster)
{
    expectChannel(downlinkOfUARFCN(412), "II", 1932.5);
    expectChannel(downlinkOfUARFCN(687), "II", 1987.5);
    expectChannel(downlinkOfUARFCN(1887), "IV", 2112.5);
    expectChannel(downlinkOfUARFCN(2087), "IV", 2152.5);
    expectChannel(downlinkOfUARFCN(1007), "V", 871.5);
    expectChannel(downlinkOfUARFCN(1087), "V", 887.5);
    expectChannel(downlinkOfUARFCN(2587), "VII", 2622.5);
    expectChannel(downlinkOfUARFCN(2912), "VII", 2687.5);
    expectChannel(downlinkOfUARFCN(3412), "X", 2112.5);
    expectChannel(downlinkOfUARFCN(3687), "X", 2167.5);
    expectChannel(downlinkOfUARFCN(3932), "XII", 731.5);
    expectChannel(downlinkOfUARFCN(3992), "XII", 743.5);
    expectChannel(downlinkOfUARFCN(4067), "XIII", 748.5);
    expectChannel(downlinkOfUARFCN(4092), "XIII", 753.5);
    expectChannel(downlinkOfUARFCN(4167), "XIV", 760.5);
    expectChannel(downlinkOfUARFCN(4192), "XIV", 765.5);
    expectChannel(downlinkOfUARFCN(787), "XIX", 877.5);
    expectChannel(downlinkOfUARFCN(837), "XIX", 887.5);
    expectChannel(downlinkOfUARFCN(6292), "XXV", 1932.5);
    expectChannel(downlinkOfUARFCN(6592), "XXV", 1992.5);
    expectChannel(downlinkOfUARFCN(5937), "XXVI", 861.5);
    expectChannel(downlinkOfUARFCN(6087), "XXVI", 891.5);
}

TEST(ChannelNumbers, AUARFCNOfNoBandIsAFifthOfAMegahertz)
{
    expectChannel(downlinkOfUARFCN(8000), "", 1600);
    expectChannel(downlinkOfUARFCN(413), "", 82.6); // beside an additional channel
    expectChannel(timeDividedUARFCN(10738), "", 2147.6);
    EXPECT_FALSE(downlinkOfUARFCN(0).megahertz);
    EXPECT_FALSE(downlinkOfUARFCN(-5).megahertz);
}

TEST(ChannelNumbers, GSMDownlinksHaveTheBoundsOfTheirBands)
{
    expectChannelBands(ofARFCN, {
                                    {"E-GSM 900", 0, 0, 935, 935},
                                    {"P-GSM 900", 1, 124, 935.2, 959.8},
                                    {"GSM 850", 128, 251, 869.2, 893.8},
                                    {"GSM 450", 259, 293, 460.6, 467.4},
                                    {"GSM 480", 306, 340, 489, 495.8},
                                    {"DCS 1800", 811, 885, 1865, 1879.8},
                                    {"ER-GSM 900", 940, 954, 918.2, 921},
                                    {"R-GSM 900", 955, 974, 921.2, 925},
                                    {"E-GSM 900", 975, 1023, 925.2, 934.8},
                                });
}

TEST(ChannelNumbers, AnARFCNOfTwoBandsNeedsAHint)
{
    for (const std::int64_t number : {512, 810}) {
        EXPECT_EQ(downlinkOfARFCN(number).band, "DCS 1800 / PCS 1900");
        EXPECT_FALSE(downlinkOfARFCN(number).megahertz);
    }
    expectChannel(downlinkOfARFCN(512, GSMBandHint::DCS1800), "DCS 1800", 1805.2);
    expectChannel(downlinkOfARFCN(810, GSMBandHint::DCS1800), "DCS 1800", 1864.8);
    expectChannel(downlinkOfARFCN(512, GSMBandHint::PCS1900), "PCS 1900", 1930.2);
    expectChannel(downlinkOfARFCN(810, GSMBandHint::PCS1900), "PCS 1900", 1989.8);
}

TEST(ChannelNumbers, AHintChangesNothingWhereAnARFCNIsOfOneBand)
{
    expectChannel(downlinkOfARFCN(66, GSMBandHint::PCS1900), "P-GSM 900", 948.2);
    expectChannel(downlinkOfARFCN(811, GSMBandHint::PCS1900), "DCS 1800", 1865);
}

TEST(ChannelNumbers, AnARFCNOfNoBandHasNoFrequency)
{
    for (const std::int64_t number : {-1, 125, 400, 886, 1024})
        EXPECT_FALSE(downlinkOfARFCN(number).megahertz) << number;
}

} // namespace ventrik
