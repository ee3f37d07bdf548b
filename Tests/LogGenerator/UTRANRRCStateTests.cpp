#include "LogGenerator/Orbel/UTRAN/RRC_State.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

class RRCStateTest : public SectionFixture<RRC_State>
{
  protected:
    RRCStateTest() { testing::internal::CaptureStderr(); }
    ~RRCStateTest() override
    {
        if (!isConsoleRead)
            testing::internal::GetCapturedStderr();
    }

    static PacketBuilder record(std::uint8_t validity, std::uint8_t state)
    {
        return PacketBuilder(0xD0E0).u8(13, validity).u8(14, state);
    }
    std::string console()
    {
        isConsoleRead = true;
        return testing::internal::GetCapturedStderr();
    }

    bool isConsoleRead = false;
};

struct StateRow {
    std::uint8_t raw;
    std::string_view label;
};

constexpr StateRow stateRows[] = {
    {0, "Disconnected"}, {1, "Connecting"},   {2, "Cell Fach"},        {3, "Cell DCH"},
    {4, "Cell PCH"},     {5, "Cell URA PCH"}, {6, "Unknown RRC Mode"}, {255, "Unknown RRC Mode"},
};

} // namespace

TEST_F(RRCStateTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "RRC Info");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xD0E0));
}

TEST_F(RRCStateTest, ShowsEachStatesLabel)
{
    for (const auto& [raw, label] : stateRows) {
        feed(record(1, raw));
        EXPECT_EQ(shown("State"), label) << int{raw};
    }
    EXPECT_THAT(keysOf(values), ElementsAre("State"));
}

TEST_F(RRCStateTest, TheStateCountsOnlyWhenTheValidityIs1)
{
    for (const std::uint8_t validity : Bytes{0, 2, 3, 255})
        for (const auto& row : stateRows) {
            feed(record(validity, row.raw));
            EXPECT_EQ(shown("State"), "Unknown RRC Mode") << int{validity} << " " << int{row.raw};
        }
}

TEST_F(RRCStateTest, ARecordOf15BytesIsTracedOnly)
{
    feed(record(1, 3));
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "RRC Info"}));
}

TEST_F(RRCStateTest, ARecordOf14BytesIsReportedAndDecodedWithTheStateAs0)
{
    feed(PacketBuilder(0xD0E0).u8(13, 1));
    EXPECT_EQ(shown("State"), "Disconnected");
    EXPECT_THAT(log.lines(),
                ElementsAre(Line{4, "RRC Info"},
                            Line{4, "LogCode_0xD0E0 is length is 14 expected size 15"}));
}

TEST_F(RRCStateTest, ARecordWithoutPayloadShowsAnUnknownState)
{
    feed(PacketBuilder(0xD0E0));
    EXPECT_EQ(shown("State"), "Unknown RRC Mode");
    EXPECT_TRUE(log.contains("LogCode_0xD0E0 is length is 13 expected size 15"));
}

TEST_F(RRCStateTest, WritesItsContainerAndTheStateToTheConsole)
{
    values.set("Other", "x");
    feed(record(1, 3));
    feed(record(0, 3));
    EXPECT_EQ(console(),
              "Display Dict = {Other = x; State = Cell DCH}, rrc mode = 3 Cell DCH\n"
              "Display Dict = {Other = x; State = Unknown RRC Mode}, rrc mode = 255 Unknown RRC "
              "Mode\n");
}

TEST_F(RRCStateTest, WithoutAContainerItOnlyWritesTheConsoleLine)
{
    RRC_State unbound(log);
    const Bytes packet = record(1, 5).build();
    unbound.updateWithData(LogPacket(packet), 0xD0E0);
    EXPECT_EQ(console(), "Display Dict = (null), rrc mode = 5 Cell URA PCH\n");
    EXPECT_TRUE(values.empty());
}

TEST_F(RRCStateTest, AnotherCodeChangesNothingAndIsNotReported)
{
    feed(PacketBuilder(0xD0E2).u8(13, 1).u8(14, 3).size(26));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "RRC Info"}));
    EXPECT_EQ(console(), "");
}

} // namespace ventrik
