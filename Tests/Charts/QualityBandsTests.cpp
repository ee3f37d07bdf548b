#include "Charts/QualityBands.h"

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;

std::string nameOf(std::string_view name, std::string_view unit)
{
    const auto found = QualityBands().find(name, unit);
    return found ? std::string(found->name) : std::string("none");
}

struct WrongLimits {
    const char* text;
    const char* told;
};

class WrongLimitsTest : public testing::TestWithParam<WrongLimits>
{
};

} // namespace

TEST(QualityBandsTest, EachQuantityHasItsLimits)
{
    const QualityBands bands;
    EXPECT_THAT(bands.find("Measured RSRP", "dBm")->from, ElementsAre(-84, -102, -111));
    EXPECT_THAT(bands.find("Average RSRQ", "dB")->from, ElementsAre(-10, -15, -20));
    EXPECT_THAT(bands.find("RSCP", "dBm")->from, ElementsAre(-70, -85, -100));
    EXPECT_THAT(bands.find("RxLev", "dBm")->from, ElementsAre(-70, -85, -100));
    EXPECT_THAT(bands.find("Ec/Io", "dB")->from, ElementsAre(-6, -10, -15));
}

TEST(QualityBandsTest, NameAndUnitTellTheQuantity)
{
    EXPECT_EQ(nameOf("RSRP Rx 0", "dBm"), "RSRP");
    EXPECT_EQ(nameOf("rsrp", "dBm"), "RSRP");
    EXPECT_EQ(nameOf("RSRP", "dB"), "none");
    EXPECT_EQ(nameOf("RSRP", ""), "none");
    EXPECT_EQ(nameOf("XRSRP", "dBm"), "none");
    EXPECT_EQ(nameOf("RSRPs", "dBm"), "none");
    EXPECT_EQ(nameOf("RSCP", "dB"), "RSCP");
    EXPECT_EQ(nameOf("Serving Rx Level", "dBm"), "RxLev");
    EXPECT_EQ(nameOf("Best Ec/No", "dB"), "Ec/Io");
    EXPECT_EQ(nameOf("Energy Per Chip", "dB"), "Ec/Io");
    EXPECT_EQ(nameOf("Temperature", "dB"), "none");
}

TEST(QualityBandsTest, OnlyTheLevelOfGSMIsToldByRSSI)
{
    EXPECT_EQ(nameOf("Measured RSSI", "dBm"), "none");
    EXPECT_EQ(nameOf("GSM RSSI", "dBm"), "RxLev");
    EXPECT_EQ(nameOf("/GSM Serving Cell/RSSI", "dBm"), "RxLev");
}

TEST(QualityBandsTest, AValueAtALimitIsAboveIt)
{
    const BandLimits limits{"RSRP", {-84, -102, -111}};
    EXPECT_EQ(limits.qualityOf(-84), Quality::Excellent);
    EXPECT_EQ(limits.qualityOf(-84.25), Quality::Good);
    EXPECT_EQ(limits.qualityOf(-102), Quality::Good);
    EXPECT_EQ(limits.qualityOf(-102.25), Quality::Fair);
    EXPECT_EQ(limits.qualityOf(-111), Quality::Fair);
    EXPECT_EQ(limits.qualityOf(-111.25), Quality::Poor);
}

TEST(QualityBandsTest, LimitsCanBeChanged)
{
    QualityBands bands;
    EXPECT_EQ(bands.change("RSRP=-80,-100,-110.5"), std::nullopt);
    EXPECT_THAT(bands.find("RSRP", "dBm")->from, ElementsAre(-80, -100, -110.5));
    EXPECT_THAT(bands.find("RSRQ", "dB")->from, ElementsAre(-10, -15, -20));
    EXPECT_EQ(bands.change("ec/no=-1,-2,-3"), std::nullopt);
    EXPECT_THAT(bands.find("Ec/Io", "dB")->from, ElementsAre(-1, -2, -3));
}

TEST_P(WrongLimitsTest, AreToldInOneLineAndChangeNothing)
{
    QualityBands bands;
    EXPECT_EQ(bands.change(GetParam().text), GetParam().told);
    EXPECT_EQ(bands.find("RSRP", "dBm"), QualityBands().find("RSRP", "dBm"));
}

INSTANTIATE_TEST_SUITE_P(
    Texts, WrongLimitsTest,
    testing::Values(
        WrongLimits{"", "\"\": limits look like RSRP=-80,-100,-110"},
        WrongLimits{"RSRP", "\"RSRP\": limits look like RSRP=-80,-100,-110"},
        WrongLimits{"RSSI=-1,-2,-3",
                    "\"RSSI=-1,-2,-3\": there are limits for RSRP, RSRQ, RSCP, RxLev, Ec/Io"},
        WrongLimits{"RSRP=-80,-100",
                    "\"RSRP=-80,-100\": three numbers are needed, as in RSRP=-80,-100,-110"},
        WrongLimits{"RSRP=-80,-100,-110,-120", "\"RSRP=-80,-100,-110,-120\": three numbers are "
                                               "needed, as in RSRP=-80,-100,-110"},
        WrongLimits{"RSRP=-80,x,-110",
                    "\"RSRP=-80,x,-110\": three numbers are needed, as in RSRP=-80,-100,-110"},
        WrongLimits{"RSRP=inf,-100,-110",
                    "\"RSRP=inf,-100,-110\": three numbers are needed, as in RSRP=-80,-100,-110"},
        WrongLimits{"RSRP=-100,-100,-110",
                    "\"RSRP=-100,-100,-110\": each limit must be below the one before"},
        WrongLimits{"RSRP=-80,-110,-100",
                    "\"RSRP=-80,-110,-100\": each limit must be below the one before"}));

} // namespace ventrik
