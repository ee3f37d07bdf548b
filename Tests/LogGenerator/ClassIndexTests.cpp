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

TEST_F(ClassIndexTest, RoutesTheUTRANCodes)
{
    const UTRANClassIndex index(log);
    EXPECT_THAT(subscriberNames(index, 0xD0E0), testing::ElementsAre("RRC Info"));
    EXPECT_THAT(subscriberNames(index, 0xD0E2), testing::ElementsAre("Serving Cell Info"));
    EXPECT_THAT(subscriberNames(index, 0xFF0001), testing::ElementsAre("Serving Cell Info"));
    EXPECT_THAT(subscriberNames(index, 0xD00A), testing::ElementsAre("Neighbor Cell List"));
    EXPECT_THAT(subscriberNames(index, 0xD00E), testing::ElementsAre("GSM Neighbor Cell List"));
    EXPECT_THAT(subscriberNames(index, 0xD00C), testing::ElementsAre("TRCH BLER", "CCTRCH SIR"));
    EXPECT_THAT(subscriberNames(index, 0xFF0002), testing::ElementsAre("PDP Context Info"));
    EXPECT_THAT(subscriberNames(index, 0xFF0000), testing::ElementsAre("SIM Info"));
    EXPECT_EQ(index.getSubscribers(0xD0E1), nullptr);
}

// The keys come in the order in which the sections registered them.
TEST_F(ClassIndexTest, CreatesTheUTRANSectionsInTheirOrder)
{
    const UTRANClassIndex index(log);
    EXPECT_THAT(index.getAllLogCodes(),
                testing::ElementsAre("53472", "53474", "16711681", "53258", "53262", "53260",
                                     "16711682", "16711680"));
    std::vector<std::string> expected(8, "Array Count: 1");
    expected[1] = "Array Count: 2";
    EXPECT_EQ(log.texts(4), expected);
}

TEST_F(ClassIndexTest, HasEveryUTRANSection)
{
    const UTRANClassIndex index(log);
    EXPECT_EQ(index.sections().size(), 8U);
    for (const char* name :
         {"RRC Info", "Serving Cell Info", "Neighbor Cell List", "GSM Neighbor Cell List",
          "TRCH BLER", "CCTRCH SIR", "PDP Context Info", "SIM Info"})
        EXPECT_NE(index.getClass(name), nullptr) << name;
}

TEST_F(ClassIndexTest, RoutesTheGSMCodes)
{
    const Orbel_GSMClassIndex index(log);
    EXPECT_THAT(
        subscriberNames(index, 0x417A),
        testing::ElementsAre("Active Set", "Detected Set", "Monitored Set", "Virtual Active Set"));
    EXPECT_THAT(subscriberNames(index, 0x7132),
                testing::ElementsAre("Process PS", "Process CO", "Serving PLMN", "Process CS"));
    EXPECT_THAT(subscriberNames(index, 0x7131), testing::ElementsAre("Process CO", "Process CS"));
    EXPECT_THAT(subscriberNames(index, 0x4005), testing::ElementsAre("GSM Set", "UMTS Set"));
    EXPECT_THAT(subscriberNames(index, 0x7130), testing::ElementsAre("Process PS"));
    EXPECT_THAT(subscriberNames(index, 0x7135),
                testing::ElementsAre("GPRS Information", "Serving PLMN"));
    EXPECT_THAT(subscriberNames(index, 0x7150), testing::ElementsAre("Equivalent PLMN List"));
    EXPECT_THAT(subscriberNames(index, 0x5137),
                testing::ElementsAre("GPRS Information", "GSM Serving Cell", "Neighboring Cells",
                                     "GSM RR Info"));
    EXPECT_THAT(subscriberNames(index, 0x51F6),
                testing::ElementsAre("GPRS Information", "GSM RR Info"));
    for (const std::uint32_t code : {0x51F5, 0x51FB, 0x51FD, 0x51F4})
        EXPECT_THAT(subscriberNames(index, code), testing::ElementsAre("GPRS Information"));
    EXPECT_THAT(subscriberNames(index, 0x5134), testing::ElementsAre("GSM Serving Cell"));
    EXPECT_THAT(subscriberNames(index, 0x5076), testing::ElementsAre("GSM Serving Cell"));
    EXPECT_THAT(subscriberNames(index, 0x51F8), testing::ElementsAre("Mobile Allocation"));
    EXPECT_THAT(subscriberNames(index, 0x51FF), testing::ElementsAre("Neighboring Cells"));
    EXPECT_THAT(subscriberNames(index, 0x512C), testing::ElementsAre("GSM RR Info"));
    EXPECT_THAT(subscriberNames(index, 0x5072), testing::ElementsAre("GSM RR Info"));
    for (const std::uint32_t code : {0x4125, 0x4031, 0x4127, 0x4157})
        EXPECT_THAT(subscriberNames(index, code), testing::ElementsAre("UMTS RR Info"));
    EXPECT_THAT(subscriberNames(index, 0x4116), testing::ElementsAre("BLER"));
    EXPECT_THAT(subscriberNames(index, 0x4221), testing::ElementsAre("HSDPA Info"));
    EXPECT_THAT(subscriberNames(index, 0xFF0001),
                testing::ElementsAre("GSM Serving Cell", "Neighboring Cells", "Serving PLMN",
                                     "UMTS Set", "UMTS RR Info"));
    EXPECT_THAT(subscriberNames(index, 0xFF0002), testing::ElementsAre("PDP Context Info"));
    EXPECT_THAT(subscriberNames(index, 0xFF0000), testing::ElementsAre("SIM Info"));
}

// Each section tells its number of codes when it is created.
TEST_F(ClassIndexTest, CreatesTheGSMSectionsInTheirOrder)
{
    const Orbel_GSMClassIndex index(log);
    std::vector<std::string> expected;
    for (const int codes :
         {1, 0, 7, 4, 1, 3, 1, 2, 0, 0, 1, 1, 0, 2, 3, 2, 1, 4, 1, 0, 2, 5, 1, 1, 1, 1})
        expected.push_back(fmt::format("Array Count: {}", codes));
    EXPECT_EQ(log.texts(4), expected);
    EXPECT_THAT(index.getAllLogCodes(),
                testing::ElementsAre("16762", "20981", "28981", "20982", "20987", "20989", "20980",
                                     "20791", "20788", "20598", "16711681", "20984", "20991",
                                     "16711682", "28976", "28978", "16389", "28977", "29008",
                                     "20780", "20594", "16677", "16433", "16679", "16727", "16662",
                                     "16711680", "16929"));
}

TEST_F(ClassIndexTest, HasEveryGSMSection)
{
    const Orbel_GSMClassIndex index(log);
    EXPECT_EQ(index.sections().size(), 26U);
    for (const char* name : {"Active Set",
                             "Coding Scheme",
                             "GPRS Information",
                             "GSM Serving Cell",
                             "Mobile Allocation",
                             "Neighboring Cells",
                             "PDP Context Info",
                             "Process PS",
                             "UMTS RR Measurement",
                             "Cell Change Counters",
                             "Detected Set",
                             "GSM Set",
                             "Non-Ranked GSM Set",
                             "Process CO",
                             "Serving PLMN",
                             "UMTS Set",
                             "Equivalent PLMN List",
                             "GSM RR Info",
                             "Monitored Set",
                             "Non-Ranked UMTS Set",
                             "Process CS",
                             "UMTS RR Info",
                             "BLER",
                             "Virtual Active Set",
                             "SIM Info",
                             "HSDPA Info"})
        EXPECT_NE(index.getClass(name), nullptr) << name;
}

} // namespace ventrik
