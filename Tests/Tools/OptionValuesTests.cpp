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
