#include "Packets/ChannelNumbers.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <span>

namespace ventrik
{

namespace
{

/// Channels that follow on each other: where they begin, in MHz, at the first number.
struct ChannelRange {
    std::string_view band;
    int first;
    int last;
    double megahertz; // of the first; 0 where it is not known
};

constexpr double lteStep = 0.1;

// LTE: 3GPP TS 36.101, table 5.7.3-1.
constexpr auto lteDownlinks = std::to_array<ChannelRange>({
    {"B1", 0, 599, 2110},        {"B2", 600, 1199, 1930},     {"B3", 1200, 1949, 1805},
    {"B4", 1950, 2399, 2110},    {"B5", 2400, 2649, 869},     {"B6", 2650, 2749, 875},
    {"B7", 2750, 3449, 2620},    {"B8", 3450, 3799, 925},     {"B9", 3800, 4149, 1844.9},
    {"B10", 4150, 4749, 2110},   {"B11", 4750, 4949, 1475.9}, {"B12", 5010, 5179, 729},
    {"B13", 5180, 5279, 746},    {"B14", 5280, 5379, 758},    {"B17", 5730, 5849, 734},
    {"B18", 5850, 5999, 860},    {"B19", 6000, 6149, 875},    {"B20", 6150, 6449, 791},
    {"B21", 6450, 6599, 1495.9}, {"B22", 6600, 7399, 3510},   {"B23", 7500, 7699, 2180},
    {"B24", 7700, 8039, 1525},   {"B25", 8040, 8689, 1930},   {"B26", 8690, 9039, 859},
    {"B27", 9040, 9209, 852},    {"B28", 9210, 9659, 758},    {"B29", 9660, 9769, 717},
    {"B30", 9770, 9869, 2350},   {"B31", 9870, 9919, 462.5},  {"B32", 9920, 10359, 1452},
    {"B65", 65536, 66435, 2110}, {"B66", 66436, 67335, 2110}, {"B67", 67336, 67535, 738},
    {"B68", 67536, 67835, 753},  {"B69", 67836, 68335, 2570}, {"B70", 68336, 68585, 1995},
    {"B71", 68586, 68935, 617},  {"B72", 68936, 68985, 461},  {"B73", 68986, 69035, 460},
    {"B74", 69036, 69465, 1475}, {"B75", 69466, 70315, 1432}, {"B76", 70316, 70365, 1427},
    {"B85", 70366, 70545, 728},  {"B87", 70546, 70595, 420},  {"B88", 70596, 70645, 422},
    {"B103", 70646, 70655, 757}, {"", 70656, 73335, 0}, // of broadcast and of bands so new that
                                                        // nothing here measures them
});
constexpr auto lteUplinks = std::to_array<ChannelRange>({
    {"B1", 18000, 18599, 1920},    {"B2", 18600, 19199, 1850},    {"B3", 19200, 19949, 1710},
    {"B4", 19950, 20399, 1710},    {"B5", 20400, 20649, 824},     {"B6", 20650, 20749, 830},
    {"B7", 20750, 21449, 2500},    {"B8", 21450, 21799, 880},     {"B9", 21800, 22149, 1749.9},
    {"B10", 22150, 22749, 1710},   {"B11", 22750, 22949, 1427.9}, {"B12", 23010, 23179, 699},
    {"B13", 23180, 23279, 777},    {"B14", 23280, 23379, 788},    {"B17", 23730, 23849, 704},
    {"B18", 23850, 23999, 815},    {"B19", 24000, 24149, 830},    {"B20", 24150, 24449, 832},
    {"B21", 24450, 24599, 1447.9}, {"B22", 24600, 25399, 3410},   {"B23", 25500, 25699, 2000},
    {"B24", 25700, 26039, 1626.5}, {"B25", 26040, 26689, 1850},   {"B26", 26690, 27039, 814},
    {"B27", 27040, 27209, 807},    {"B28", 27210, 27659, 703},    {"B30", 27660, 27759, 2305},
    {"B31", 27760, 27809, 452.5},  {"B65", 131072, 131971, 1920}, {"B66", 131972, 132671, 1710},
    {"B68", 132672, 132971, 698},  {"B70", 132972, 133121, 1695}, {"B71", 133122, 133471, 663},
    {"B72", 133472, 133521, 451},  {"B73", 133522, 133571, 450},  {"B74", 133572, 134001, 1427},
    {"B85", 134002, 134181, 698},  {"B87", 134182, 134231, 410},  {"B88", 134232, 134281, 412},
    {"B103", 134282, 134291, 787}, {"B106", 134292, 134341, 896},
});
// Both directions take turns on one frequency.
constexpr auto lteTimeDivided = std::to_array<ChannelRange>({
    {"B33", 36000, 36199, 1900}, {"B34", 36200, 36349, 2010}, {"B35", 36350, 36949, 1850},
    {"B36", 36950, 37549, 1930}, {"B37", 37550, 37749, 1910}, {"B38", 37750, 38249, 2570},
    {"B39", 38250, 38649, 1880}, {"B40", 38650, 39649, 2300}, {"B41", 39650, 41589, 2496},
    {"B42", 41590, 43589, 3400}, {"B43", 43590, 45589, 3600}, {"B44", 45590, 46589, 703},
    {"B45", 46590, 46789, 1447}, {"B46", 46790, 54539, 5150}, {"B47", 54540, 55239, 5855},
    {"B48", 55240, 56739, 3550}, {"B49", 56740, 58239, 3550}, {"B50", 58240, 59089, 1432},
    {"B51", 59090, 59139, 1427}, {"B52", 59140, 60139, 3300}, {"B53", 60140, 60254, 2483.5},
    {"B54", 60255, 60304, 1670},
});

// UMTS: 3GPP TS 25.101, tables 5.1 and 5.1A. Band VI lies within band V, at the same numbers.
constexpr double umtsStep = 0.2;
constexpr auto umtsDownlinks = std::to_array<ChannelRange>({
    {"I", 10562, 10838, 2112.4}, {"II", 9662, 9938, 1932.4},   {"III", 1162, 1513, 1807.4},
    {"IV", 1537, 1738, 2112.4},  {"V", 4357, 4458, 871.4},     {"VII", 2237, 2563, 2622.4},
    {"VIII", 2937, 3088, 927.4}, {"IX", 9237, 9387, 1847.4},   {"X", 3112, 3388, 2112.4},
    {"XI", 3712, 3787, 1478.4},  {"XII", 3842, 3903, 731.4},   {"XIII", 4017, 4043, 748.4},
    {"XIV", 4117, 4143, 760.4},  {"XIX", 712, 763, 877.4},     {"XX", 4512, 4638, 793.4},
    {"XXI", 862, 912, 1498.4},   {"XXII", 4662, 5038, 3512.4}, {"XXV", 5112, 5413, 1932.4},
    {"XXVI", 5762, 5913, 861.4},
});

/// Channels between those of the raster.
struct AdditionalChannels {
    std::string_view band;
    double offset; // MHz
    std::span<const std::int64_t> numbers;
};
constexpr auto channelsOfII =
    std::to_array<std::int64_t>({412, 437, 462, 487, 512, 537, 562, 587, 612, 637, 662, 687});
constexpr auto channelsOfIV =
    std::to_array<std::int64_t>({1887, 1912, 1937, 1962, 1987, 2012, 2037, 2062, 2087});
constexpr auto channelsOfV = std::to_array<std::int64_t>({1007, 1012, 1032, 1037, 1062, 1087});
constexpr auto channelsOfVII = std::to_array<std::int64_t>(
    {2587, 2612, 2637, 2662, 2687, 2712, 2737, 2762, 2787, 2812, 2837, 2862, 2887, 2912});
constexpr auto channelsOfX = std::to_array<std::int64_t>(
    {3412, 3437, 3462, 3487, 3512, 3537, 3562, 3587, 3612, 3637, 3662, 3687});
constexpr auto channelsOfXII = std::to_array<std::int64_t>({3932, 3957, 3962, 3987, 3992});
constexpr auto channelsOfXIII = std::to_array<std::int64_t>({4067, 4092});
constexpr auto channelsOfXIV = std::to_array<std::int64_t>({4167, 4192});
constexpr auto channelsOfXIX = std::to_array<std::int64_t>({787, 812, 837});
constexpr auto channelsOfXXV = std::to_array<std::int64_t>(
    {6292, 6317, 6342, 6367, 6392, 6417, 6442, 6467, 6492, 6517, 6542, 6567, 6592});
constexpr auto channelsOfXXVI =
    std::to_array<std::int64_t>({5937, 5962, 5987, 5992, 6012, 6017, 6037, 6042, 6062, 6067, 6087});
constexpr auto umtsAdditional = std::to_array<AdditionalChannels>({
    {"II", 1850.1, channelsOfII},
    {"IV", 1735.1, channelsOfIV},
    {"V", 670.1, channelsOfV},
    {"VII", 2105.1, channelsOfVII},
    {"X", 1430.1, channelsOfX},
    {"XII", -54.9, channelsOfXII},
    {"XIII", -64.9, channelsOfXIII},
    {"XIV", -72.9, channelsOfXIV},
    {"XIX", 720.1, channelsOfXIX},
    {"XXV", 674.1, channelsOfXXV},
    {"XXVI", -325.9, channelsOfXXVI},
});
// 3GPP TS 25.102, of 1.28 Mcps. All count from 0 MHz on.
constexpr auto umtsTimeDivided = std::to_array<ChannelRange>({
    {"TDD f", 9404, 9596, 1880.8},
    {"TDD a", 10054, 10121, 2010.8},
    {"TDD e", 11504, 11996, 2300.8},
    {"TDD d", 12854, 13096, 2570.8},
});

// GSM: 3GPP TS 45.005, table 2-2.
constexpr double gsmStep = 0.2;
constexpr auto gsmDownlinks = std::to_array<ChannelRange>({
    {"E-GSM 900", 0, 0, 935},
    {"P-GSM 900", 1, 124, 935.2},
    {"GSM 850", 128, 251, 869.2},
    {"GSM 450", 259, 293, 460.6},
    {"GSM 480", 306, 340, 489},
    {"DCS 1800", 811, 885, 1865},
    {"ER-GSM 900", 940, 954, 918.2},
    {"R-GSM 900", 955, 974, 921.2},
    {"E-GSM 900", 975, 1023, 925.2},
});
constexpr ChannelRange dcs{"DCS 1800", 512, 810, 1805.2};
constexpr ChannelRange pcs{"PCS 1900", 512, 810, 1930.2};

constexpr bool holds(const ChannelRange& range, double number)
{
    return range.first <= number && number <= range.last;
}

// All channels lie at whole tenths of a megahertz: no more is said than that.
double wholeTenths(double megahertz)
{
    return std::round(megahertz * 10) / 10;
}

ChannelFrequency frequencyIn(const ChannelRange& range, std::int64_t number, double step)
{
    if (range.megahertz == 0)
        return {range.band, {}};
    const auto steps = static_cast<double>(number - range.first);
    return {range.band, wholeTenths(range.megahertz + steps * step)};
}

const ChannelRange* find(std::span<const ChannelRange> ranges, double number)
{
    const auto found = std::ranges::find_if(
        ranges, [number](const ChannelRange& range) { return holds(range, number); });
    return found == ranges.end() ? nullptr : &*found;
}

const ChannelRange* findEARFCN(std::span<const ChannelRange> ranges, double number)
{
    const ChannelRange* range = find(ranges, number);
    return range ? range : find(lteTimeDivided, number);
}

ChannelFrequency frequencyOfEARFCN(std::span<const ChannelRange> ranges, std::int64_t number)
{
    const ChannelRange* range = findEARFCN(ranges, static_cast<double>(number));
    return range ? frequencyIn(*range, number, lteStep) : ChannelFrequency();
}

std::optional<ChannelFrequency> frequencyOfUARFCN(std::span<const ChannelRange> ranges,
                                                  std::int64_t number)
{
    const ChannelRange* range = find(ranges, static_cast<double>(number));
    return range ? std::optional(frequencyIn(*range, number, umtsStep)) : std::nullopt;
}

ChannelFrequency withoutBand(std::int64_t uarfcn)
{
    if (uarfcn <= 0)
        return {};
    return {{}, wholeTenths(static_cast<double>(uarfcn) * umtsStep)};
}

std::optional<ChannelFrequency> additionalOfUARFCN(std::int64_t number)
{
    for (const AdditionalChannels& channels : umtsAdditional)
        if (std::ranges::find(channels.numbers, number) != channels.numbers.end())
            return ChannelFrequency{
                channels.band,
                wholeTenths(static_cast<double>(number) * umtsStep + channels.offset)};
    return std::nullopt;
}

} // namespace

ChannelFrequency downlinkOfEARFCN(std::int64_t number)
{
    return frequencyOfEARFCN(lteDownlinks, number);
}

ChannelFrequency uplinkOfEARFCN(std::int64_t number)
{
    return frequencyOfEARFCN(lteUplinks, number);
}

bool isDownlinkEARFCN(double number)
{
    return findEARFCN(lteDownlinks, number);
}

bool isUplinkEARFCN(double number)
{
    return findEARFCN(lteUplinks, number);
}

ChannelFrequency downlinkOfUARFCN(std::int64_t number)
{
    if (const auto inBand = frequencyOfUARFCN(umtsDownlinks, number))
        return *inBand;
    return additionalOfUARFCN(number).value_or(withoutBand(number));
}

ChannelFrequency timeDividedUARFCN(std::int64_t number)
{
    return frequencyOfUARFCN(umtsTimeDivided, number).value_or(withoutBand(number));
}

ChannelFrequency downlinkOfARFCN(std::int64_t number, GSMBandHint hint)
{
    if (!holds(dcs, static_cast<double>(number))) {
        const ChannelRange* range = find(gsmDownlinks, static_cast<double>(number));
        return range ? frequencyIn(*range, number, gsmStep) : ChannelFrequency();
    }
    switch (hint) {
    case GSMBandHint::DCS1800:
        return frequencyIn(dcs, number, gsmStep);
    case GSMBandHint::PCS1900:
        return frequencyIn(pcs, number, gsmStep);
    case GSMBandHint::None:
        break;
    }
    return {"DCS 1800 / PCS 1900", {}};
}

} // namespace ventrik
