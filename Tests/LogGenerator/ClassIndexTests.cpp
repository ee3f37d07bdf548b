#include "LogGenerator/Orbel/GSM/Orbel_GSMClassIndex.h"
#include "LogGenerator/Orbel/LTE/LTEClassIndex.h"
#include "LogGenerator/Orbel/UTRAN/UTRANClassIndex.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

std::vector<std::string_view> subscriberNames(const ClassIndex& index, std::uint32_t code)
{
    std::vector<std::string_view> names;
    if (const auto* sections = index.getSubscribers(code))
        for (const Base* section : *sections)
            names.push_back(section->getSectionName());
    return names;
}

class ClassIndexTest : public testing::Test
{
  protected:
    CapturingSystemLog log;
};

} // namespace

TEST_F(ClassIndexTest, RoutesTheLTECodes)
{
    const LTEClassIndex index(log);
    EXPECT_THAT(subscriberNames(index, 0xB0C2), testing::ElementsAre("Serving Cell Info"));
    EXPECT_THAT(subscriberNames(index, 0xB0C1), testing::ElementsAre("Serving Cell Info"));
    EXPECT_THAT(subscriberNames(index, 0xFF0001), testing::ElementsAre("Serving Cell Info"));
    EXPECT_THAT(subscriberNames(index, 0xB17F), testing::ElementsAre("Serving Cell Measurements"));
    EXPECT_THAT(subscriberNames(index, 0xB179),
                testing::ElementsAre("Connected mode LTE Intra-frequency Measurement",
                                     "Measured Neighbor Cells", "Detected Cells"));
    EXPECT_THAT(subscriberNames(index, 0xB180),
                testing::ElementsAre("Neighbor Measurements", "Neighbor Cells List"));
    EXPECT_THAT(subscriberNames(index, 0xB186),
                testing::ElementsAre("Reselection Candidates", "Reselection Candidates List"));
    EXPECT_THAT(subscriberNames(index, 0xFF0000), testing::ElementsAre("SIM Info"));
    EXPECT_THAT(subscriberNames(index, 0xFF0002), testing::ElementsAre("PDP Context Info"));
}

TEST_F(ClassIndexTest, GivesNullForACodeThatNoSectionLists)
{
    const LTEClassIndex index(log);
    EXPECT_EQ(index.getSubscribers(0x1234), nullptr);
    EXPECT_EQ(index.getSubscribers(0xFF00B0), nullptr);
}

TEST_F(ClassIndexTest, GivesNullForAnUnknownName)
{
    const LTEClassIndex index(log);
    EXPECT_EQ(index.getClass("RRC Info"), nullptr);
}

TEST_F(ClassIndexTest, ListsEachCodeOnceAsADecimalString)
{
    const LTEClassIndex index(log);
    EXPECT_THAT(index.getAllLogCodes(),
                testing::UnorderedElementsAre("45250", "45249", "16711681", "45433", "45439",
                                              "45440", "45446", "16711680", "16711682"));
}

TEST_F(ClassIndexTest, CreationLogsEachSectionsCodeCountInOrder)
{
    const LTEClassIndex index(log);
    std::vector<std::string> expected(11, "Array Count: 1");
    expected[0] = "Array Count: 3";
    EXPECT_EQ(log.texts(4), expected);
}

TEST_F(ClassIndexTest, StatusWritesTwoLines)
{
    const LTEClassIndex index(log);
    log.clear();
    index.status();
    EXPECT_THAT(log.texts(4), testing::ElementsAre("Dictionary = 1", "String = 0"));
}

TEST_F(ClassIndexTest, SaysFarewellOnStandardOutput)
{
    testing::internal::CaptureStdout();
    {
        const LTEClassIndex index(log);
    }
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "Deallocing ClassIndex\n");
}

TEST_F(ClassIndexTest, HasEveryLTESection)
{
    const LTEClassIndex index(log);
    EXPECT_EQ(index.sections().size(), 11U);
    for (const char* name :
         {"Serving Cell Info", "Connected mode LTE Intra-frequency Measurement",
          "Measured Neighbor Cells", "Detected Cells", "Serving Cell Measurements",
          "Neighbor Measurements", "Neighbor Cells List", "Reselection Candidates",
          "Reselection Candidates List", "SIM Info", "PDP Context Info"})
        EXPECT_NE(index.getClass(name), nullptr) << name;
}

// What is not built yet is not there at all. Each family leaves this test when it comes.
TEST_F(ClassIndexTest, GSMAndUTRANSectionsAreNotBuiltYet)
{
    EXPECT_TRUE(Orbel_GSMClassIndex(log).sections().empty());
    EXPECT_TRUE(UTRANClassIndex(log).sections().empty());
}

} // namespace ventrik
