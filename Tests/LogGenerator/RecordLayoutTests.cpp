// Sections that read a record by one of several layouts, and what they know of it.

#include "LogGenerator/Orbel/GSM/Orbel_GSMClassIndex.h"
#include "LogGenerator/Orbel/LTE/LTEClassIndex.h"
#include "Platform/TelephonyConstants.h"
#include "Tests/LogGenerator/GeneratorFixture.h"
#include "Tests/Support/ResourceFiles.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;

// Cell 301 on 1300, or another one, as version 3 tells it.
PacketBuilder cellInfo(std::uint16_t identity = 301, std::uint32_t earfcn = 1300)
{
    return PacketBuilder(0xB0C2).size(42).u8(13, 3).u16(14, identity).u32(16, earfcn);
}

// Version 2 of the master information: its antennas are the byte at 22.
PacketBuilder masterInformation(std::uint8_t antennas, std::uint16_t identity = 301,
                                std::uint32_t earfcn = 1300)
{
    return PacketBuilder(0xB0C1)
        .size(24)
        .u8(13, 2)
        .u16(14, identity)
        .u32(16, earfcn)
        .u8(22, antennas);
}

class LTECellLayoutTest : public SectionFixture<LTEServingCellInfo>
{
  protected:
    std::string antennas() { return shown("Num Tx Antennas"); }
};

class ConnectedModeLayoutTest : public SectionFixture<ConnectedModeMeasurementMisc>
{
};

class MeasuredNeighborLayoutTest : public ListSectionFixture<MeasuredNeighborCells>
{
};

// Version 4 of a connected-mode measurement, of a carrier, without any cells.
PacketBuilder connectedMode(std::uint8_t carrier, std::uint16_t identity)
{
    return PacketBuilder(0xB179).size(41).u8(13, 4).u8(17, carrier).u32(21, 1300).u16(25, identity);
}

class LTERecordsModeTest : public GeneratorFixture
{
  protected:
    LTERecordsModeTest() { addTemplates(platform.resources, VENTRIK_RESOURCES); }

    std::unique_ptr<LogGenerator> generator(RecordsMode records)
    {
        return LogGenerator::generatorsReading(records)(kQXLogChannelTechnology_Orbel_LTE,
                                                        services());
    }
    std::vector<std::int64_t> codesOf(const LogGenerator& generator)
    {
        std::vector<std::int64_t> codes;
        const PlistDictionary command = generator.getStartCommand();
        for (const PlistValue& code : *command.find("SetOrbelLogCodes")->array())
            codes.push_back(code.integer()->signedBits());
        return codes;
    }
    std::vector<std::string> warningsAt(const LogGenerator& generator,
                                        std::vector<std::string_view> path)
    {
        std::vector<std::string> warnings;
        for (const ReadLayout& layout : generator.layoutsAt(state, path))
            if (layout.kind == LayoutKind::NotKnown)
                warnings.push_back(warningOf(layout));
        return warnings;
    }
    std::string shown(std::initializer_list<std::string_view> path)
    {
        return textAt(*state.find("Display"), path);
    }
};

} // namespace

// ---- The antenna count is the serving cell's

TEST_F(LTECellLayoutTest, TheAntennaCountShowsBeforeAnyCellIsKnown)
{
    feed(masterInformation(4));
    EXPECT_EQ(antennas(), "4");
}

TEST_F(LTECellLayoutTest, TheAntennaCountOfTheServingCellShows)
{
    feed(cellInfo());
    feed(masterInformation(4));
    EXPECT_EQ(antennas(), "4");
}

TEST_F(LTECellLayoutTest, TheAntennaCountOfAScannedCellDoesNotShow)
{
    feed(cellInfo());
    feed(masterInformation(2));
    feed(masterInformation(4, 302));
    feed(masterInformation(1, 301, 1301));
    EXPECT_EQ(antennas(), "2");
}

TEST_F(LTECellLayoutTest, TheServingCellIsThatOfTheLastCellInfo)
{
    feed(cellInfo());
    feed(masterInformation(2));
    feed(cellInfo(302));
    feed(masterInformation(1));
    EXPECT_EQ(antennas(), "2");
    feed(masterInformation(4, 302));
    EXPECT_EQ(antennas(), "4");
}

// The base layout does not tell of which cell it is.
TEST_F(LTECellLayoutTest, TheBaseAntennaCountAlwaysShows)
{
    feed(cellInfo());
    feed(PacketBuilder(0xB0C1).size(22).u8(13, 1).u16(14, 302).u8(20, 4));
    EXPECT_EQ(antennas(), "4");
}

TEST_F(LTECellLayoutTest, ItsRecordIsReportedByEveryLayout)
{
    feed(masterInformation(4));
    feed(masterInformation(4, 302));
    EXPECT_THAT(log.texts(LogPriority::error),
                ElementsAre("Received an unknown log message: 45249",
                            "Received an unknown log message: 45249"));
}

// ---- Added carriers

TEST_F(ConnectedModeLayoutTest, AnAddedCarrierLeavesTheServingCellAlone)
{
    feed(connectedMode(0, 301));
    feed(connectedMode(1, 77));
    EXPECT_EQ(shown("Serving Physical Cell ID"), "301");
    feed(connectedMode(0, 302));
    EXPECT_EQ(shown("Serving Physical Cell ID"), "302");
}

TEST_F(MeasuredNeighborLayoutTest, AnAddedCarriersNeighborsShow)
{
    feed(connectedMode(1, 77).size(53).u8(37, 1).u16(41, 13));
    ASSERT_EQ(rows.size(), 1U);
    EXPECT_EQ(shown(0, "Physical Cell ID"), "13");
}

// Only the base layout has a size to doubt.
TEST_F(MeasuredNeighborLayoutTest, NoNeighborsAreNothingUnexpected)
{
    feed(connectedMode(0, 301).size(53).u8(37, 1));
    feed(connectedMode(0, 301));
    EXPECT_TRUE(rows.empty());
    EXPECT_THAT(log.texts(LogPriority::error), IsEmpty());
}

// ---- A rank that is none

TEST(RankedCellLayout, ARankThatIsNoneLeavesItsKeyOut)
{
    CapturingSystemLog log;
    UMTSSet section(log);
    PlistArray container;
    section.updateSectionRef(container);
    const auto feed = [&](std::uint16_t rank) {
        const Bytes packet =
            PacketBuilder(0x4005).size(25).u8(13, 1).u16(20, rank).u16(23, 7).build();
        section.updateWithData(LogPacket(packet), 0x4005);
    };
    feed(0x8000);
    EXPECT_THAT(keysOf(*container[0].dictionary()),
                ElementsAre("Scrambling Code", "RSCP", "Energy Per Chip", "Downlink Frequency",
                            "Ranking Value"));
    feed(0xFFFF);
    EXPECT_EQ(textAt(container[0], {"Rank Cell RSCP"}), "-1 dB");
    feed(0x8000);
    EXPECT_EQ(textAt(container[0], {"Rank Cell RSCP"}), "(none)");
}

// ---- What a section knows

TEST_F(LTECellLayoutTest, KnowsHowEachOfItsRecordsWasRead)
{
    EXPECT_THAT(section.layouts(), IsEmpty());
    feed(cellInfo());
    feed(PacketBuilder(0xB0C1).size(22).u8(13, 1));
    EXPECT_THAT(section.layouts(), ElementsAre(ReadLayout{0xB0C2, 3, 42, LayoutKind::Newer},
                                               ReadLayout{0xB0C1, 1, 22, LayoutKind::Base}));
    feed(cellInfo().size(50));
    EXPECT_EQ(section.layouts().front(), (ReadLayout{0xB0C2, 3, 50, LayoutKind::NotKnown}));
}

TEST_F(LTECellLayoutTest, ReadsEveryRecordByTheBaseLayoutWhereThatIsAskedFor)
{
    section.readRecords(RecordsMode::Base);
    feed(cellInfo().u16(18, 9).u16(16, 1300)); // the upper half of the newer frequency
    EXPECT_EQ(shown("Upload Frequency"), "9");
    EXPECT_EQ(section.layouts().front(), (ReadLayout{0xB0C2, 3, 42, LayoutKind::Base}));
}

// ---- Generators

TEST_F(LTERecordsModeTest, OnlyExtendedRecordsJoinTheStartCommand)
{
    const std::vector<std::int64_t> base{0xB0C2, 0xB0C1, 0xB179, 0xB17F, 0xB180, 0xB186};
    for (const RecordsMode records : {RecordsMode::Base, RecordsMode::Newer})
        EXPECT_THAT(codesOf(*generator(records)), testing::UnorderedElementsAreArray(base));
    auto extended = base;
    extended.insert(extended.end(), {0xB0C0, 0xB0EE, 0xB192, 0xB193, 0xB195});
    EXPECT_THAT(codesOf(*generator(RecordsMode::Extended)),
                testing::UnorderedElementsAreArray(extended));
}

TEST_F(LTERecordsModeTest, TheExtensionStandsAtTheEndOfTheDisplay)
{
    generator(RecordsMode::Extended)->updateState(state, cellInfo().build());
    EXPECT_EQ(keysOf(*state.find("Display")->dictionary()).back(), "More");
    EXPECT_EQ(shown({"More", "EPS Registration", "EMM State"}), "-");
}

TEST_F(LTERecordsModeTest, OtherModesHaveTheirDisplayWithoutIt)
{
    generator(RecordsMode::Newer)->updateState(state, cellInfo().build());
    EXPECT_EQ(keysOf(*state.find("Display")->dictionary()).back(), "SIM Info");
}

// A display of one mode has no place for what the other one shows.
TEST_F(LTERecordsModeTest, ADisplayOfAnotherModeMakesWay)
{
    generator(RecordsMode::Newer)->updateState(state, cellInfo().build());
    const auto extended = generator(RecordsMode::Extended);
    extended->updateState(state, PacketBuilder(0xB0EE).size(32).u8(13, 2).u8(14, 3).build());
    EXPECT_EQ(shown({"More", "EPS Registration", "EMM State"}), "EMM_REGISTERED");
    generator(RecordsMode::Newer)->updateState(state, cellInfo().build());
    EXPECT_EQ(keysOf(*state.find("Display")->dictionary()).back(), "SIM Info");
}

TEST_F(LTERecordsModeTest, AMissingExtensionIsTheDisplaysFault)
{
    platform.resources = {};
    addFile(platform.resources, VENTRIK_RESOURCES "/LTE.plist");
    const auto extended = generator(RecordsMode::Extended);
    extended->updateState(state, cellInfo().build());
    EXPECT_FALSE(state.contains("Display"));
    EXPECT_EQ(extended->displayFault(), "display template LTEMore.plist is missing");
}

TEST_F(LTERecordsModeTest, TellsTheLayoutsOfASectionAtItsPathAndBelow)
{
    const auto newer = generator(RecordsMode::Newer);
    newer->updateState(state, cellInfo().build());
    newer->updateState(state, PacketBuilder(0xB180).size(60).u8(13, 7).build());
    const std::string warning = "0xB180 version 7: layout not known, values may be wrong";
    EXPECT_THAT(warningsAt(*newer, {"Neighbors", "Neighbor Cells List"}), ElementsAre(warning));
    EXPECT_THAT(warningsAt(*newer, {"Neighbors", "Neighbor Cells List", "0"}),
                ElementsAre(warning));
    EXPECT_THAT(warningsAt(*newer, {"Neighbors", "Neighbor Measurements", "Version"}),
                ElementsAre(warning));
    EXPECT_THAT(warningsAt(*newer, {"Neighbors"}), IsEmpty());
    EXPECT_THAT(warningsAt(*newer, {}), IsEmpty());
    EXPECT_THAT(warningsAt(*newer, {"Serving Cell Info"}), IsEmpty());
}

TEST_F(LTERecordsModeTest, TellsTheLayoutsOfAllSectionsOnce)
{
    const auto newer = generator(RecordsMode::Newer);
    newer->updateState(state, cellInfo().build());
    newer->updateState(state, PacketBuilder(0xB180).size(60).u8(13, 7).build());
    EXPECT_THAT(newer->layouts(), ElementsAre(ReadLayout{0xB0C2, 3, 42, LayoutKind::Newer},
                                              ReadLayout{0xB180, 7, 60, LayoutKind::NotKnown}));
}

TEST_F(LTERecordsModeTest, TellsHowTheLastRecordWasRead)
{
    const auto newer = generator(RecordsMode::Newer);
    EXPECT_EQ(newer->lastRead(), nullptr);
    newer->updateState(state, cellInfo().build());
    ASSERT_TRUE(newer->lastRead());
    EXPECT_EQ(*newer->lastRead(), (ReadLayout{0xB0C2, 3, 42, LayoutKind::Newer}));
    for (const Bytes& unread : {PacketBuilder(0x1234).size(42).build(), Bytes(5, 1), Bytes(42, 7),
                                PacketBuilder(0xB0C2).size(20).build()}) {
        newer->updateState(state, cellInfo().build());
        newer->updateState(state, unread);
        EXPECT_EQ(newer->lastRead(), nullptr);
    }
}

// A warning goes when a record comes whose layout is known.
TEST_F(LTERecordsModeTest, AKnownLayoutEndsTheWarning)
{
    const auto newer = generator(RecordsMode::Newer);
    newer->updateState(state, cellInfo().size(50).build());
    EXPECT_THAT(warningsAt(*newer, {"Serving Cell Info"}), testing::SizeIs(1));
    newer->updateState(state, cellInfo().build());
    EXPECT_THAT(warningsAt(*newer, {"Serving Cell Info"}), IsEmpty());
}

// An extended record that is not known shows nothing, and leaves what is there.
TEST_F(LTERecordsModeTest, AnUnknownExtensionLeavesTheDisplayAndIsMarked)
{
    const auto extended = generator(RecordsMode::Extended);
    extended->updateState(state, PacketBuilder(0xB0EE).size(32).u8(13, 2).u8(14, 3).build());
    extended->updateState(state, PacketBuilder(0xB0EE).size(32).u8(13, 5).u8(14, 1).build());
    EXPECT_EQ(shown({"More", "EPS Registration", "EMM State"}), "EMM_REGISTERED");
    EXPECT_THAT(warningsAt(*extended, {"More", "EPS Registration"}),
                ElementsAre("0xB0EE version 5: layout not known, values may be wrong"));
}

// The response follows a request of 28 bytes; its head has 12; RSRP of the first cell is at 12.
TEST_F(LTERecordsModeTest, TheOriginOfANeighborsSignalIsWhereItStandsInThePacket)
{
    const std::size_t response = 17 + 28;
    const auto extended = generator(RecordsMode::Extended);
    extended->updateState(state, PacketBuilder(0xB195)
                                     .size(response + 12 + 52)
                                     .u8(14, 2)
                                     .u8(17, 30)
                                     .u16(19, 28)
                                     .u8(response, 31)
                                     .u8(response + 1, 4)
                                     .u16(response + 2, 64)
                                     .u32(response + 4, 1300)
                                     .u16(response + 8, 1)
                                     .build());
    const std::vector<std::string_view> level{"More", "Neighbors", "Connected Neighbor Cells", "0",
                                              "Measured RSRP"};
    const auto origin = extended->originOf(state, level);
    ASSERT_TRUE(origin);
    EXPECT_EQ(origin->firstByte(), response + 12 + 12);
    EXPECT_EQ(origin->version, 4);
    const std::vector<std::string_view> frequency{"More", "Neighbors", "Connected Neighbors",
                                                  "E-ARFCN"};
    ASSERT_TRUE(extended->originOf(state, frequency));
    EXPECT_EQ(extended->originOf(state, frequency)->firstByte(), response + 4);
}

// The newer RSRP begins in byte 25.
TEST_F(LTERecordsModeTest, TheOriginOfAValueIsThatOfItsLayout)
{
    const auto newer = generator(RecordsMode::Newer);
    newer->updateState(state, PacketBuilder(0xB17F).size(49).u8(13, 5).u16(25, 1260).build());
    const std::vector<std::string_view> level{"Serving Cell Measurements", "Measured RSRP"};
    const auto origin = newer->originOf(state, level);
    ASSERT_TRUE(origin);
    EXPECT_EQ(origin->firstByte(), 25U);
    EXPECT_EQ(origin->version, 5);
    EXPECT_DOUBLE_EQ(origin->number().value(), -101.25);
}

} // namespace ventrik
