#include "LogGenerator/Orbel/SimInfo.h"
#include "LogGenerator/Orbel/UnparsableDataException.h"
#include "Tests/LogGenerator/GeneratorFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using Line = CapturingSystemLog::Line;

constexpr std::uint32_t simFilesCode = 0xFF0000;

class SimInfoTest : public SectionFixture<SimInfo>
{
  protected:
    void files(const PlistValue& root) { feed(propertyListPacket(simFilesCode, root)); }
};

constexpr std::pair<std::string_view, std::string_view> fileRows[] = {
    {"kSimFile_ICCID", "EF-ICCID"},
    {"kSimFile_MSISDN", "EF-MSISDN"},
    {"kSimFile_MBDN", "EF-3GPP MAIL BOX DIALING NUMBER"},
    {"kSimFile_HPPLMN", "EF-HPPLMN SEARCH PERIOD"},
    {"kSimFile_LOCI", "EF-LOCI"},
    {"kSimFile_PSLOCI", "EF-GPRS/PS-LOCI"},
    {"kSimFile_ACC", "EF-ACCESS CONTROL CLASS"},
    {"kSimFile_AD", "EF-ADMINISTRATIVE DATA"},
    {"kSimFile_FPLMN", "EF-FPLMN"},
    {"kSimFile_AHPLMN", "EF-ACTING HPLMN"},
    {"kSimFile_RATMODE", "EF-RAT MODE"},
    {"kSimFile_PNN", "EF-PLMN NETWORK NAME"},
    {"kSimFile_OPL", "EF-OPERATOR PLMN LIST"},
    {"kSimFile_OPLMNAcT", "EF-OPLMNAcT"},
};

} // namespace

TEST_F(SimInfoTest, NamesItselfAndItsCode)
{
    EXPECT_EQ(section.getSectionName(), "SIM Info");
    EXPECT_THAT(section.getLogCodeArray(), ElementsAre(0xFF0000));
}

TEST_F(SimInfoTest, ShowsEachFileUnderItsKeyInOrder)
{
    PlistDictionary root;
    std::vector<std::string> keys;
    for (const auto& [file, key] : fileRows) {
        root.set(file, fmt::format("contents of {}", file));
        keys.emplace_back(key);
    }
    files(root);
    for (const auto& [file, key] : fileRows)
        EXPECT_EQ(shown(key), fmt::format("contents of {}", file));
    EXPECT_EQ(keysOf(values), keys);
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "SimInfo"}));
}

TEST_F(SimInfoTest, AnAbsentFileLeavesItsKeyAsItWas)
{
    values.set("EF-LOCI", "-");
    files(PlistDictionary{{"kSimFile_ICCID", "8949"}});
    EXPECT_EQ(shown("EF-ICCID"), "8949");
    EXPECT_EQ(shown("EF-LOCI"), "-");
    EXPECT_EQ(values.size(), 2U);
}

TEST_F(SimInfoTest, ValuesOfAnyKindAreStoredAsTheyAre)
{
    files(PlistDictionary{{"kSimFile_AD", Bytes{0, 2}}, {"kSimFile_FPLMN", PlistArray{"26201"}}});
    EXPECT_EQ(*values.find("EF-ADMINISTRATIVE DATA"), PlistValue(Bytes{0, 2}));
    EXPECT_EQ(*values.find("EF-FPLMN"), PlistValue(PlistArray{"26201"}));
}

TEST_F(SimInfoTest, DataThatDoesNotParseIsReportedAndRaised)
{
    EXPECT_THROW(feed(PacketBuilder(simFilesCode).u8(13, 'x')), UnparsableDataException);
    EXPECT_THAT(log.lines(),
                ElementsAre(Line{4, "SimInfo"}, Line{3, "SIM File dictionary data could not be "
                                                        "constructed"}));
    EXPECT_TRUE(values.empty());
}

TEST_F(SimInfoTest, ARootThatIsNoDictionaryCountsAsUnparsed)
{
    EXPECT_THROW(files(PlistArray()), UnparsableDataException);
    EXPECT_TRUE(log.contains("SIM File dictionary data could not be constructed"));
}

TEST_F(SimInfoTest, AnotherCodeChangesNothingAndIsNotReported)
{
    feed(propertyListPacket(0xFF0002, PlistDictionary{{"kSimFile_ICCID", "8949"}}));
    EXPECT_TRUE(values.empty());
    EXPECT_THAT(log.lines(), ElementsAre(Line{4, "SimInfo"}));
}

} // namespace ventrik
