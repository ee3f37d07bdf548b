#include "LogGenerator/Orbel/LTE/LTESections.h"
#include "LogGenerator/Orbel/LTE/ReselectionCandidatesList.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;

// One candidate of that technology, with room for its technology part.
PacketBuilder candidateRecord(std::uint16_t technology, std::uint16_t count = 1)
{
    return PacketBuilder(0xB186).u16(19, count).u16(21, 5).u16(23, technology).size(33);
}

using ReselectionCandidatesMiscTest = SectionFixture<ReselectionCandidatesMisc>;

class ReselectionCandidatesListTest : public ListSectionFixture<ReselectionCandidatesList>
{
  protected:
    std::vector<std::string> keysOfRow(std::size_t row) { return keysOf(*rows[row].dictionary()); }
};

} // namespace

TEST_F(ReselectionCandidatesMiscTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "Reselection Candidates");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xB186));
}

TEST_F(ReselectionCandidatesMiscTest, ShowsItsThreeValuesInOrder)
{
    feed(PacketBuilder(0xB186).u8(13, 1).u16(15, 1300).u16(17, 65535).size(21));
    EXPECT_EQ(shown("Version"), "1");
    EXPECT_EQ(shown("Serving EARFCN"), "1300");
    EXPECT_EQ(shown("Serving Cell ID"), "65535");
    EXPECT_THAT(keysOf(values), ElementsAre("Version", "Serving EARFCN", "Serving Cell ID"));
    EXPECT_THAT(log.texts(), ElementsAre("Reselection Candidates"));
}

TEST_F(ReselectionCandidatesMiscTest, ARecordOf20BytesChangesNothing)
{
    feed(PacketBuilder(0xB186).size(20));
    EXPECT_TRUE(values.empty());
}

TEST_F(ReselectionCandidatesMiscTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0xB180).size(60));
    EXPECT_TRUE(log.contains("Received an unknown log message: 45440"));
}

TEST_F(ReselectionCandidatesListTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "Reselection Candidates List");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xB186));
}

TEST_F(ReselectionCandidatesListTest, ShowsAnLTECandidate)
{
    feed(candidateRecord(0).u16(25, 3050).bits(27, 7, 9, 47));
    EXPECT_THAT(keysOfRow(0),
                ElementsAre("Candidate Priority", "Candidate RAT Type", "E ARFCN", "Cell ID"));
    EXPECT_EQ(shown(0, "Candidate Priority"), "5");
    EXPECT_EQ(shown(0, "Candidate RAT Type"), "LTE");
    EXPECT_EQ(shown(0, "E ARFCN"), "3050");
    EXPECT_EQ(shown(0, "Cell ID"), "47");
    EXPECT_THAT(log.texts(), ElementsAre("Reselection Candidates List"));
}

TEST_F(ReselectionCandidatesListTest, ShowsAUTRANCandidate)
{
    feed(candidateRecord(1).u16(25, 10562).u16(27, 511));
    EXPECT_THAT(keysOfRow(0),
                ElementsAre("Candidate Priority", "Candidate RAT Type", "U ARFCN", "PSC"));
    EXPECT_EQ(shown(0, "Candidate RAT Type"), "UTRAN");
    EXPECT_EQ(shown(0, "U ARFCN"), "10562");
    EXPECT_EQ(shown(0, "PSC"), "511");
}

TEST_F(ReselectionCandidatesListTest, ShowsAGERANCandidate)
{
    feed(candidateRecord(2).u16(25, 124).u8(27, 3).u8(28, 63));
    EXPECT_THAT(keysOfRow(0), ElementsAre("Candidate Priority", "Candidate RAT Type", "ARFCN",
                                          "Band", "BSIC ID"));
    EXPECT_EQ(shown(0, "Candidate RAT Type"), "GERAN");
    EXPECT_EQ(shown(0, "ARFCN"), "124");
    EXPECT_EQ(shown(0, "Band"), "3");
    EXPECT_EQ(shown(0, "BSIC ID"), "63");
}

TEST_F(ReselectionCandidatesListTest, ShowsBothKindsOfCDMACandidates)
{
    for (const auto& [technology, label] :
         {std::pair<std::uint16_t, std::string>{3, "CDMA1XRTT"}, {4, "CDMAHRPD"}}) {
        feed(candidateRecord(technology).u8(25, 10).u16(29, 384).u16(31, 511));
        EXPECT_THAT(keysOfRow(0), ElementsAre("Candidate Priority", "Candidate RAT Type", "Band",
                                              "Channel", "Pilot"));
        EXPECT_EQ(shown(0, "Candidate RAT Type"), label);
        EXPECT_EQ(shown(0, "Band"), "10");
        EXPECT_EQ(shown(0, "Channel"), "384");
        EXPECT_EQ(shown(0, "Pilot"), "511");
    }
}

TEST_F(ReselectionCandidatesListTest, AnUnknownTechnologyHasTwoRowsOnly)
{
    for (const std::uint16_t technology :
         {std::uint16_t{5}, std::uint16_t{7}, std::uint16_t{65535}}) {
        feed(candidateRecord(technology));
        EXPECT_THAT(keysOfRow(0), ElementsAre("Candidate Priority", "Candidate RAT Type"));
        EXPECT_EQ(shown(0, "Candidate RAT Type"), "??");
    }
}

TEST_F(ReselectionCandidatesListTest, CandidatesAreFourBytesApart)
{
    // The second candidate's header is the first one's technology part.
    feed(candidateRecord(0, 2).u16(25, 1300).u16(27, 1));
    ASSERT_EQ(rows.size(), 2U);
    EXPECT_EQ(shown(0, "E ARFCN"), "1300");
    EXPECT_EQ(shown(1, "Candidate Priority"), "1300");
    EXPECT_EQ(shown(1, "Candidate RAT Type"), "UTRAN");
}

TEST_F(ReselectionCandidatesListTest, TheCountIsTakenAs8Bits)
{
    rows.append("row");
    feed(candidateRecord(7, 256));
    EXPECT_TRUE(rows.empty());
    feed(candidateRecord(7, 257));
    EXPECT_EQ(rows.size(), 1U);
}

TEST_F(ReselectionCandidatesListTest, ManyCandidatesEndWithTheLastCompleteOne)
{
    PacketBuilder packet = candidateRecord(7, 255);
    for (std::size_t i = 0; i < 255; ++i)
        packet.u16(23 + 4 * i, 7);
    feed(packet);
    EXPECT_EQ(rows.size(), 255U);
    feed(packet.size(21 + 4 * 10 + 3));
    EXPECT_EQ(rows.size(), 10U);
}

TEST_F(ReselectionCandidatesListTest, ACandidateNeedsItsTechnologyPart)
{
    struct Need {
        std::uint16_t technology;
        std::size_t bytes;
    };
    for (const auto& [technology, bytes] :
         {Need{0, 8}, Need{1, 8}, Need{2, 8}, Need{3, 12}, Need{4, 12}, Need{5, 4}}) {
        feed(candidateRecord(technology).size(21 + bytes));
        EXPECT_EQ(rows.size(), 1U) << technology;
        feed(candidateRecord(technology).size(21 + bytes - 1));
        EXPECT_TRUE(rows.empty()) << technology;
    }
}

TEST_F(ReselectionCandidatesListTest, ARecordOf21BytesHasNoCandidates)
{
    rows.append("row");
    feed(PacketBuilder(0xB186).size(21));
    EXPECT_TRUE(rows.empty());
}

TEST_F(ReselectionCandidatesListTest, ARecordOf20BytesLeavesTheListAsItWas)
{
    rows.append("row");
    feed(candidateRecord(0).size(20));
    EXPECT_EQ(rows.size(), 1U);
}

TEST_F(ReselectionCandidatesListTest, AnotherCodeIsReported)
{
    feed(PacketBuilder(0xB180).size(60));
    EXPECT_TRUE(log.contains("Received an unknown log message: 45440"));
}

} // namespace ventrik
