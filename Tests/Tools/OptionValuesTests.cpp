#include "Platform/SystemLog.h"
#include "Tools/OptionValues.h"

#include <gmock/gmock.h>

namespace ventrik
{

TEST(OptionValues, NamesEveryTechnology)
{
    const std::string names = technologyNames();
    for (const Technology& technology : technologies()) {
        EXPECT_THAT(names, testing::HasSubstr(std::string(technology.name)));
        EXPECT_EQ(technologyValue(std::string(technology.name)).linkType, technology.linkType);
    }
    EXPECT_THROW(technologyValue("LTE"), WrongValue);
}

TEST(OptionValues, NamesLogLevelsFromTheLeastUrgentOn)
{
    EXPECT_EQ(logLevelNames(LogPriority::error),
              "debug, info, notice, warning, error (default), critical, alert or emergency");
    EXPECT_EQ(logLevelValue("debug"), LogPriority::debug);
    EXPECT_EQ(logLevelValue("emergency"), LogPriority::emergency);
    EXPECT_THROW(logLevelValue("Error"), WrongValue);
}

TEST(OptionValues, TakeWholeNumbersBelowTwoToThe32)
{
    EXPECT_EQ(wholeNumberValue("0"), 0U);
    EXPECT_EQ(wholeNumberValue("4294967295"), 4294967295U);
    for (const char* text : {"", "4294967296", "99999999999999999999", "-1", "1.5", "1 ", "x"})
        EXPECT_THROW(wholeNumberValue(text), WrongValue) << text;
}

TEST(OptionValues, TakeASizeOrATimeForARotation)
{
    using namespace std::chrono_literals;
    EXPECT_EQ(rotationValue("64K").size, 65536U);
    EXPECT_EQ(rotationValue("100M").size, std::uint64_t{100} << 20);
    EXPECT_EQ(rotationValue("2G").size, std::uint64_t{2} << 30);
    EXPECT_FALSE(rotationValue("100M").time);
    EXPECT_EQ(rotationValue("90s").time, 90s);
    EXPECT_EQ(rotationValue("15min").time, 15min);
    EXPECT_EQ(rotationValue("1h").time, 1h);
    EXPECT_EQ(rotationValue("2d").time, 48h);
    EXPECT_GT(rotationValue("4294967295d").time, 20000h);
    EXPECT_FALSE(rotationValue("1h").size);
    for (const char* text :
         {"", "100", "0M", "63K", "-1h", "1m", "1.5h", "1 h", "h", "99999999999M"})
        EXPECT_THROW(rotationValue(text), WrongValue) << text;
}

TEST(OptionValues, TakeASizeForAHistory)
{
    EXPECT_EQ(historySizeValue("8M"), std::size_t{8} << 20);
    EXPECT_EQ(historySizeValue("2G"), std::size_t{2} << 30);
    for (const char* text : {"", "7M", "64", "64h", "-8M"})
        EXPECT_THROW(historySizeValue(text), WrongValue) << text;
}

TEST(OptionValues, TakeATimeForAHistory)
{
    using namespace std::chrono_literals;
    EXPECT_EQ(historyAgeValue("24h"), 24h);
    EXPECT_EQ(historyAgeValue("90s"), 90s);
    for (const char* text : {"", "24", "24M", "-1h"})
        EXPECT_THROW(historyAgeValue(text), WrongValue) << text;
}

TEST(OptionValues, TakeSeveralAlertsAndSayWhatIsWrongWithOne)
{
    std::vector<ValueAlert> alerts;
    addAlert(alerts, "/Cell/RSRP < -110");
    addAlert(alerts, "/Cell/RSRQ < -15");
    EXPECT_EQ(alerts.size(), 2U);
    EXPECT_THROW(addAlert(alerts, "RSRP"), WrongValue);
    EXPECT_EQ(alerts.size(), 2U);
}

TEST(OptionValues, TakeBandsAndSayWhatIsWrongWithThem)
{
    QualityBands bands;
    changeBands(bands, "RSRP=-70,-90,-100");
    const auto limits = bands.find("RSRP", "dBm");
    ASSERT_TRUE(limits);
    EXPECT_EQ(limits->from.front(), -70);
    EXPECT_THROW(changeBands(bands, "RSRP=good"), WrongValue);
}

TEST(OptionValues, TakeASpeedOrNone)
{
    EXPECT_EQ(speedValue("2.5"), 2.5);
    EXPECT_EQ(speedValue("max"), std::nullopt);
    EXPECT_THROW(speedValue("fast"), WrongValue);
}

TEST(OptionValues, TakeNumbersAboveZero)
{
    EXPECT_EQ(positiveNumberValue("0.5"), 0.5);
    for (const char* text : {"", "0", "-1", "inf", "nan", "1e999", "2x"})
        EXPECT_THROW(positiveNumberValue(text), WrongValue) << text;
}

TEST(OptionValues, TakeDirectoriesThatAreThere)
{
    EXPECT_EQ(directoryValue("/"), "/");
    EXPECT_THROW(directoryValue("/dev/null"), WrongValue);
    EXPECT_THROW(directoryValue("/missing"), WrongValue);
}

} // namespace ventrik
