#include "PropertyList/PropertyListReader.h"
#include "Tests/Process/DecodeFixture.h"

namespace ventrik
{

namespace
{

class DecodeSnapshot : public DecodeFixture
{
  protected:
    /// Messages at 0 s, 2 s (on the tick, and so of it), 2.5 s and 9 s.
    static PcapBytes capture()
    {
        return lteCapture()
            .record(captureStart, 0, cellInfoMessage(301))
            .record(captureStart + 2, 0, antennaMessage(1))
            .record(captureStart + 2, 500000, antennaMessage(2))
            .record(captureStart + 9, 0, antennaMessage(4));
    }
    void makeSnapshot()
    {
        const Result result =
            decode(capture(), {"--snapshot", snapshotFile, "--description", "On the road"});
        ASSERT_EQ(result.status, 0) << result.errors;
    }
    PlistDictionary readSnapshot()
    {
        makeSnapshot();
        const std::string text = readFile(snapshotFile);
        const auto reading = readPropertyList(Bytes(text.begin(), text.end()));
        EXPECT_TRUE(reading) << reading.error;
        return reading ? *reading.value->dictionary() : PlistDictionary();
    }
    static Bytes joined(Bytes first, const Bytes& second)
    {
        first.insert(first.end(), second.begin(), second.end());
        return first;
    }
    static void expectPeriod(const PlistValue& value, const Bytes& packets, const std::string& date)
    {
        const PlistDictionary& entry = *value.dictionary();
        EXPECT_EQ(*entry.find("DisplayState"), packets);
        EXPECT_TRUE(entry.find("Display")->dictionary());
        EXPECT_EQ(*entry.find("ExtraInfo"), PlistDictionary());
        EXPECT_EQ(*entry.find("Date"), date);
        EXPECT_EQ(*entry.find("Description"), "Snapshot (" + date + ")");
        EXPECT_EQ(entry.size(), 5U);
    }

    std::string snapshotFile = path("road.ventrik");
};

constexpr const char* pythonScript = R"(
import plistlib, sys
snapshot = plistlib.load(open(sys.argv[1], "rb"))
print(snapshot["Timestamp"])
print(snapshot["Description"])
for entry in snapshot["Data"]:
    print(entry["Description"], len(entry.get("DisplayState") or entry["DLF"]))
print(snapshot["Data"][2]["Display"]["Serving Cell Info"]["Num Tx Antennas"])
)";

} // namespace

TEST_F(DecodeSnapshot, HoldsTheTimeOfTheLastMessageAndTheDescription)
{
    const PlistDictionary snapshot = readSnapshot();
    EXPECT_EQ(*snapshot.find("Timestamp"), "2001-09-09 01:46:49 +0000");
    EXPECT_EQ(*snapshot.find("Description"), "On the road");
}

TEST_F(DecodeSnapshot, HoldsAnEntryForEachTickThatFoundMessages)
{
    const PlistDictionary snapshot = readSnapshot();
    const PlistArray& data = *snapshot.find("Data")->array();
    ASSERT_EQ(data.size(), 4U);
    expectPeriod(data[0], joined(cellInfoMessage(301), antennaMessage(1)),
                 "2001-09-09 01:46:42 +0000");
    expectPeriod(data[1], antennaMessage(2), "2001-09-09 01:46:44 +0000");
    expectPeriod(data[2], antennaMessage(4), "2001-09-09 01:46:49 +0000");
}

TEST_F(DecodeSnapshot, EndsWithADLFOfAllPeriods)
{
    const PlistDictionary snapshot = readSnapshot();
    const PlistDictionary& entry = *(*snapshot.find("Data")->array())[3].dictionary();
    // The version record and, of each period, all but its first byte: 161 + 59 + 21 + 21.
    EXPECT_EQ(*entry.find("Description"), "DLF binary (262 bytes)");
    const Bytes& dlf = *entry.find("DLF")->data();
    ASSERT_EQ(dlf.size(), 262U);
    EXPECT_THAT(Bytes(dlf.begin(), dlf.begin() + 4), testing::ElementsAre(161, 0, 0xFD, 0x1F));
    const Bytes cell = cellInfoMessage(301);
    EXPECT_EQ(Bytes(dlf.begin() + 161, dlf.begin() + 198), Bytes(cell.begin() + 1, cell.end()));
}

TEST_F(DecodeSnapshot, IsReadByPython)
{
    makeSnapshot();
    Program python("/usr/bin/python3", {"-c", pythonScript, snapshotFile}, environment);
    EXPECT_EQ(python.waitForEnd(), 0) << python.errors();
    EXPECT_EQ(python.output(), "2001-09-09 01:46:49 +0000\n"
                               "On the road\n"
                               "Snapshot (2001-09-09 01:46:42 +0000) 60\n"
                               "Snapshot (2001-09-09 01:46:44 +0000) 22\n"
                               "Snapshot (2001-09-09 01:46:49 +0000) 22\n"
                               "DLF binary (262 bytes) 262\n"
                               "4\n");
}

// A limit on the size of files stands for the full disk.
TEST_F(DecodeSnapshot, ThatDoesNotFitOnTheDiskLeavesTheOldOneAndNothingElse)
{
    const std::string directory = path("logs");
    const std::string snapshot = writeFile("logs/old", "the old one");
    const std::string capture = writeFile("cells.pcap", cellCapture().bytes());
    Program program("/bin/sh",
                    {"-c", "trap '' XFSZ; ulimit -f 0; exec \"$@\"", "sh",
                     VENTRIK_PROGRAMS "/ventrik-decode", "--snapshot", snapshot, capture},
                    environment);
    EXPECT_EQ(program.waitForEnd(), 1);
    EXPECT_TRUE(program.says("ventrik-decode: " + snapshot + ": File too large\n"))
        << program.errors();
    EXPECT_EQ(readFile(snapshot), "the old one");
    EXPECT_EQ(namesIn(directory), std::set<std::string>{"old"});
}

TEST_F(DecodeSnapshot, IsMadeAlsoOfTextThatXmlCannotCarry)
{
    const std::string snapshot = path("snapshot");
    // A binary property list: one row of one value, the bytes 1 and 'a'.
    const Bytes row{'b', 'p', 'l', 'i', 's', 't', '0', '0', 0xA1, 0x01, 0x52, 0x01, 'a', 8, 10, 0,
                    0,   0,   0,   0,   0,   1,   1,   0,   0,    0,    0,    0,    0,   0, 2,  0,
                    0,   0,   0,   0,   0,   0,   0,   0,   0,    0,    0,    0,    0,   0, 13};
    const Result result =
        decode(lteCapture().record(captureStart, 0, PacketBuilder(0xFF0002).bytes(13, row).build()),
               {"--resources", VENTRIK_RESOURCES, "--snapshot", snapshot});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_THAT(result.complaints,
                testing::ElementsAre("ventrik-decode: " + snapshot +
                                     ": 1 characters that XML cannot carry are written as U+FFFD"));
    EXPECT_THAT(readFile(snapshot), testing::HasSubstr("<string>\uFFFDa</string>"));
}

} // namespace ventrik
