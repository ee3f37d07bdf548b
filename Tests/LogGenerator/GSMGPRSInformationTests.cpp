#include "LogGenerator/Orbel/GSM/GSMSections.h"
#include "Tests/LogGenerator/RecordFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

using GPRSInformationTest = RecordFixture<GPRSInformation>;

constexpr RecordSize sizes[] = {{0x51F5, 18}, {0x7135, 32}, {0x51F6, 24}, {0x51FB, 34},
                                {0x51FD, 35}, {0x51F4, 15}, {0x5137, 29}};

constexpr RecordField fields[] = {
    {0x51F5, 15, 8, 0, "Network Control Order", "NC0"},
    {0x51F5, 15, 8, 1, "Network Control Order", "NC1"},
    {0x51F5, 15, 8, 2, "Network Control Order", "NC2"},
    {0x51F5, 15, 8, 3, "Network Control Order", "Unknown"},
    {0x51F5, 15, 8, 254, "Network Control Order", "Unknown"},
    {0x51F5, 15, 8, 255, "Network Control Order", "Not Available"},
    {0x51F5, 13, 8, 0, "PFC Supported", "Not Supported"},
    {0x51F5, 13, 8, 1, "PFC Supported", "Supported"},
    {0x51F5, 13, 8, 2, "PFC Supported", "Unknown"},
    {0x51F5, 13, 8, 254, "PFC Supported", "Unknown"},
    {0x51F5, 13, 8, 255, "PFC Supported", "Available"},
    {0x51F5, 14, 8, 0, "Priority Access Threshold", "Barred (PKT access not allowed in the Cell)"},
    {0x51F5, 14, 8, 1, "Priority Access Threshold", "Barred"},
    {0x51F5, 14, 8, 2, "Priority Access Threshold", "Barred"},
    {0x51F5, 14, 8, 3, "Priority Access Threshold", "1 Only"},
    {0x51F5, 14, 8, 4, "Priority Access Threshold", "1 to 2"},
    {0x51F5, 14, 8, 5, "Priority Access Threshold", "1 to 3"},
    {0x51F5, 14, 8, 6, "Priority Access Threshold", "1 to 4"},
    {0x51F5, 14, 8, 7, "Priority Access Threshold", "Allowed"},
    {0x51F5, 14, 8, 8, "Priority Access Threshold", "Unknown"},
    {0x51F5, 14, 8, 254, "Priority Access Threshold", "Unknown"},
    {0x51F5, 14, 8, 255, "Priority Access Threshold", "Not Available"},
    {0x7135, 13, 8, 0, "Network Operating Mode", "Class 1"},
    {0x7135, 13, 8, 1, "Network Operating Mode", "Class 2"},
    {0x7135, 13, 8, 2, "Network Operating Mode", "Class 3"},
    {0x7135, 13, 8, 3, "Network Operating Mode", "Unknown"},
    {0x7135, 13, 8, 255, "Network Operating Mode", "Unknown"},
    {0x51F6, 15, 8, 0, "T3192", "500 ms"},
    {0x51F6, 15, 8, 1, "T3192", "1000 ms"},
    {0x51F6, 15, 8, 2, "T3192", "1500 ms"},
    {0x51F6, 15, 8, 3, "T3192", "0 ms"},
    {0x51F6, 15, 8, 4, "T3192", "80 ms"},
    {0x51F6, 15, 8, 5, "T3192", "120 ms"},
    {0x51F6, 15, 8, 6, "T3192", "160 ms"},
    {0x51F6, 15, 8, 7, "T3192", "200 ms"},
    {0x51F6, 15, 8, 8, "T3192", "?? ms"},
    {0x51F6, 15, 8, 9, "T3192", "?? ms"},
    {0x51F6, 15, 8, 255, "T3192", "?? ms"},
    {0x51F6, 17, 8, 0, "Access Burst Type", "8-bit format"},
    {0x51F6, 17, 8, 1, "Access Burst Type", "11-bit format"},
    {0x51F6, 17, 8, 255, "Access Burst Type", "11-bit format"},
    {0x51F6, 16, 8, 0, "DRX Timer Max", "0"},
    {0x51F6, 16, 8, 255, "DRX Timer Max", "255"},
    {0x51FB, 13, 8, 1, "PBCCH Present", "1"},
    {0x51FB, 13, 8, 255, "PBCCH Present", "255"},
    {0x51FD, 16, 8, 2, "Ext Measurement Order", "2"},
    {0x51FD, 16, 8, 255, "Ext Measurement Order", "255"},
    {0x51FD, 13, 8, 3, "Packet PSI Status", "3"},
    {0x51FD, 13, 8, 255, "Packet PSI Status", "255"},
    {0x51FD, 33, 8, 0, "Packet SI Status", "Not Supported"},
    {0x51FD, 33, 8, 1, "Packet SI Status", "Supported"},
    {0x51FD, 33, 8, 255, "Packet SI Status", "Supported"},
    {0x51FD, 14, 8, 4, "Count LR", "4"},
    {0x51FD, 14, 8, 255, "Count LR", "255"},
    {0x51FD, 15, 8, 5, "Count HR", "5"},
    {0x51FD, 15, 8, 255, "Count HR", "255"},
    {0x51F4, 14, 8, 0, "SI13 Position", "Located on BCCH"},
    {0x51F4, 14, 8, 1, "SI13 Position", "Located on Extended BCCH"},
    {0x51F4, 14, 8, 2, "SI13 Position", "Unknown"},
    {0x51F4, 14, 8, 254, "SI13 Position", "Unknown"},
    {0x51F4, 14, 8, 255, "SI13 Position", "Not Available"},
    {0x5137, 26, 8, 0, "Cell Reselect Hysteresis", "Not Applied"},
    {0x5137, 26, 8, 1, "Cell Reselect Hysteresis", "Applied"},
    {0x5137, 26, 8, 255, "Cell Reselect Hysteresis", "Applied"},
};

} // namespace

TEST_F(GPRSInformationTest, NamesItselfAndItsCodes)
{
    EXPECT_EQ(section.getSectionName(), "GPRS Information");
    EXPECT_THAT(section.getLogCodeArray(),
                ElementsAre(0x51F5, 0x7135, 0x51F6, 0x51FB, 0x51FD, 0x51F4, 0x5137));
}

TEST_F(GPRSInformationTest, EachFieldIsReadFromItsBytesAlone)
{
    expectFields(fields, sizes);
}

TEST_F(GPRSInformationTest, EachRecordHasItsMinimumSize)
{
    expectMinimumSizes(sizes, "GPRSInformation");
}

TEST_F(GPRSInformationTest, EachRecordShowsItsKeysInOrder)
{
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x51F5).size(18)),
                ElementsAre("Network Control Order", "PFC Supported", "Priority Access Threshold"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x7135).size(32)),
                ElementsAre("Network Operating Mode"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x51F6).size(24)),
                ElementsAre("T3192", "Access Burst Type", "DRX Timer Max"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x51FB).size(34)), ElementsAre("PBCCH Present"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x51FD).size(35)),
                ElementsAre("Ext Measurement Order", "Packet PSI Status", "Packet SI Status",
                            "Count LR", "Count HR"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x51F4).size(15)), ElementsAre("SI13 Position"));
    EXPECT_THAT(keysOfRecord(PacketBuilder(0x5137).size(29)),
                ElementsAre("Cell Reselect Hysteresis"));
    EXPECT_EQ(log.lines(), std::vector<Line>(7, Line{4, "GPRSInformation"}));
}

TEST_F(GPRSInformationTest, ARecordLeavesTheValuesOfTheOthers)
{
    for (const RecordSize& size : sizes)
        feed(PacketBuilder(size.code).size(size.minimum));
    EXPECT_EQ(values.size(), 15U); // 3 + 1 + 3 + 1 + 5 + 1 + 1
}

// Their neighbours in the numbering are not the section's.
TEST_F(GPRSInformationTest, OtherCodesAreReported)
{
    for (const std::uint32_t code : {0x51F7, 0x51F8, 0x51F9, 0x51FA, 0x51FC})
        feed(PacketBuilder(code).size(60));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.texts(3), ElementsAre("Received an unknown log message: 20983",
                                          "Received an unknown log message: 20984",
                                          "Received an unknown log message: 20985",
                                          "Received an unknown log message: 20986",
                                          "Received an unknown log message: 20988"));
    EXPECT_EQ(log.texts(4), std::vector<std::string>(5, "GPRSInformation"));
}

} // namespace ventrik
