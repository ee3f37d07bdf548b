#include "Capture/SnapshotFile.h"
#include "PropertyList/PropertyListReader.h"
#include "Tests/Support/TemporaryFile.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

namespace ventrik
{

namespace
{

std::vector<std::string> keysOf(const PlistDictionary& dictionary)
{
    std::vector<std::string> keys;
    for (const auto& entry : dictionary)
        keys.push_back(entry.key);
    return keys;
}

Bytes contentsOf(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

} // namespace

TEST(SnapshotFile, HoldsTimestampDataAndDescription)
{
    const auto snapshot = makeSnapshot("2026-11-16 06:10:28 +0000", PlistArray{"x"}, "drive");
    EXPECT_THAT(keysOf(snapshot), testing::ElementsAre("Timestamp", "Data", "Description"));
    EXPECT_EQ(*snapshot.find("Timestamp"), PlistValue("2026-11-16 06:10:28 +0000"));
    EXPECT_EQ(*snapshot.find("Data"), PlistValue(PlistArray{"x"}));
    EXPECT_EQ(*snapshot.find("Description"), PlistValue("drive"));
}

TEST(SnapshotFile, AnEmptyDescriptionIsWrittenEmpty)
{
    EXPECT_EQ(*makeSnapshot("t", PlistArray(), "").find("Description"), PlistValue(""));
}

TEST(SnapshotFile, WithoutSaveContentsItHoldsOnlyTheTimestamp)
{
    EXPECT_THAT(keysOf(makeSnapshot("t", std::nullopt, "drive")),
                testing::ElementsAre("Timestamp"));
}

TEST(SnapshotFile, IsNamedByTheWholeSecond)
{
    using namespace std::chrono_literals;
    EXPECT_EQ(snapshotFileName("/logs", Clock::TimePoint(1794809428s + 999ms)),
              "/logs/VentrikSnapshot-1794809428.ventrik");
}

TEST(SnapshotFile, IsWrittenAsAPropertyListThatReadsBackUnchanged)
{
    const auto snapshot =
        makeSnapshot("t",
                     PlistArray{PlistDictionary{{"Description", "DLF binary (2 bytes)"},
                                                {"DLF", Bytes{0, 255}}}},
                     "a < b");
    const TemporaryFile file("written.ventrik");
    const std::string& path = file.path();
    const auto writing = writeSnapshot(snapshot, path);
    ASSERT_TRUE(writing) << writing.error;
    EXPECT_EQ(writing.replaced, 0U);
    const auto reading = readPropertyList(contentsOf(path));
    ASSERT_TRUE(reading) << reading.error;
    EXPECT_EQ(*reading.value, PlistValue(snapshot));
}

TEST(SnapshotFile, OverwritesAnEarlierFileOfItsName)
{
    const TemporaryFile file("twice.ventrik");
    const std::string& path = file.path();
    ASSERT_TRUE(writeSnapshot(makeSnapshot("a", PlistArray(), std::string(1000, 'x')), path));
    ASSERT_TRUE(writeSnapshot(makeSnapshot("b", PlistArray(), ""), path));
    EXPECT_EQ(*readPropertyList(contentsOf(path)).value->dictionary()->find("Timestamp"),
              PlistValue("b"));
}

TEST(SnapshotFile, TellsWhyAFileCannotBeWritten)
{
    const auto writing = writeSnapshot(makeSnapshot("t", PlistArray(), ""), "/nowhere/x.ventrik");
    EXPECT_FALSE(writing);
    EXPECT_EQ(writing.error, "/nowhere/x.ventrik: No such file or directory");
}

TEST(SnapshotFile, HoldsAReplacementForEachCharacterThatXmlCannotCarry)
{
    const TemporaryFile file("replaced.ventrik");
    const PlistArray data{PlistDictionary{{"EF-PNN", "a\x01\x02z"}, {"b\xFF", "\uFFFE"}}};
    const auto writing = writeSnapshot(makeSnapshot("t", data, "drive"), file.path());
    ASSERT_TRUE(writing) << writing.error;
    EXPECT_EQ(writing.replaced, 4U);
    const PlistArray expected{PlistDictionary{{"EF-PNN", "a\uFFFD\uFFFDz"}, {"b\uFFFD", "\uFFFD"}}};
    EXPECT_EQ(*readPropertyList(contentsOf(file.path())).value->dictionary()->find("Data"),
              PlistValue(expected));
}

TEST(SnapshotFile, IsItsOwnersAlone)
{
    const TemporaryFile file("private.ventrik");
    ASSERT_TRUE(writeSnapshot(makeSnapshot("t", PlistArray(), ""), file.path()));
    EXPECT_EQ(std::filesystem::status(file.path()).permissions(),
              std::filesystem::perms::owner_read | std::filesystem::perms::owner_write);
}

} // namespace ventrik
