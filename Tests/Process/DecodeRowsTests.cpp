#include "Tests/Process/DecodeFixture.h"

#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>

#include <algorithm>
#include <filesystem>
#include <sstream>

#include <sys/stat.h>

namespace ventrik
{

namespace
{

using testing::Contains;
using testing::Each;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;
using testing::StartsWith;

QJsonObject objectOf(const std::string& line)
{
    return QJsonDocument::fromJson(QByteArray::fromStdString(line)).object();
}

std::string textOf(const QJsonValue& value)
{
    return value.toString().toStdString();
}

class DecodeRows : public DecodeFixture
{
  protected:
    static std::vector<QJsonObject> rowsOf(const Result& result)
    {
        std::vector<QJsonObject> rows;
        for (const std::string& line : linesOf(result.output))
            rows.push_back(objectOf(line));
        return rows;
    }
    /// Those of values, as "record path=text".
    static std::vector<std::string> valuesOf(const Result& result)
    {
        std::vector<std::string> values;
        for (const QJsonObject& row : rowsOf(result))
            if (!row.contains("status"))
                values.push_back(fmt::format("{} {}={}", row["record"].toInt(), textOf(row["path"]),
                                             textOf(row["text"])));
        return values;
    }
    /// Those that close captures, as "name status records rows".
    static std::vector<std::string> closingsOf(const Result& result)
    {
        std::vector<std::string> closings;
        for (const QJsonObject& row : rowsOf(result))
            if (row.contains("status"))
                closings.push_back(fmt::format(
                    "{} {} {} {}",
                    std::filesystem::path(textOf(row["capture"])).filename().native(),
                    textOf(row["status"]), row["records"].toInt(), row["rows"].toInt()));
        return closings;
    }
    Result decodeRows(const Arguments& arguments) const
    {
        Arguments all{"--format", "rows"};
        all.insert(all.end(), arguments.begin(), arguments.end());
        return decode(all);
    }
    std::string write(const std::string& name, const PcapBytes& capture) const
    {
        return writeFile(name, capture.bytes());
    }
    std::string writeCells(const std::string& name) const { return write(name, cellCapture()); }
    /// Cut within its second message.
    std::string writeDamaged(const std::string& name) const
    {
        Bytes bytes = cellCapture().bytes();
        bytes.resize(bytes.size() - 5);
        return writeFile(name, bytes);
    }
};

} // namespace

// The template has "Physical Cell ID" and "Num Tx Antennas" in a section, and a note.
TEST_F(DecodeRows, TellEachValueThatChangedAndTheEnd)
{
    const Result result = decodeRows({writeCells("cells.pcap")});
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(valuesOf(result), Contains("0 /Serving Cell Info/Physical Cell ID=301"));
    EXPECT_THAT(valuesOf(result), Contains("1 /Serving Cell Info/Num Tx Antennas=2"));
    EXPECT_THAT(closingsOf(result), ElementsAre(StartsWith("cells.pcap ok 2 ")));
}

TEST_F(DecodeRows, HaveTheirColumns)
{
    const Result result = decodeRows({writeCells("cells.pcap")});
    const auto rows = rowsOf(result);
    const auto row = std::ranges::find_if(rows, [](const QJsonObject& candidate) {
        return candidate["name"] == "Num Tx Antennas" && candidate["record"] == 1;
    });
    ASSERT_NE(row, rows.end());
    EXPECT_EQ((*row)["time"], "2001-09-09T01:46:40.000001Z");
    EXPECT_EQ((*row)["technology"], "lte");
    EXPECT_EQ((*row)["code"], "0xB0C1");
    EXPECT_EQ((*row)["layout"], "base");
    EXPECT_EQ((*row)["section"], "Serving Cell Info");
    EXPECT_EQ((*row)["number"], 2);
    EXPECT_TRUE((*row)["unit"].isNull());
    EXPECT_TRUE((*row)["index"].isNull());
    EXPECT_TRUE((*row)["subscription"].isNull());
}

TEST_F(DecodeRows, AreTheSameEachTime)
{
    const std::string capture = writeCells("cells.pcap");
    EXPECT_EQ(decodeRows({capture}).output, decodeRows({capture}).output);
}

TEST_F(DecodeRows, AreATableWhereThatIsAskedFor)
{
    const Result result = decode({"--format", "csv", writeCells("cells.pcap")});
    const auto lines = linesOf(result.output);
    EXPECT_THAT(lines.front(), StartsWith("capture,record,time,"));
    EXPECT_THAT(lines, Contains(HasSubstr(",Serving Cell Info,/Serving Cell Info/Num Tx Antennas,,"
                                          "Num Tx Antennas,2,,2,")));
    EXPECT_THAT(lines.back(), HasSubstr(",ok,,,2,2,"));
}

TEST_F(DecodeRows, OfDamageEndWithWhatWasDecodedBefore)
{
    const Result result = decodeRows({writeDamaged("bad.pcap")});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(valuesOf(result), Contains("0 /Serving Cell Info/Physical Cell ID=301"));
    const QJsonObject closing = rowsOf(result).back();
    EXPECT_EQ(closing["status"], "damaged");
    EXPECT_EQ(closing["offset"], 24 + 16 + 38); // the file's head and the first message
    EXPECT_THAT(textOf(closing["reason"]), HasSubstr("bad.pcap: message 1: "));
    EXPECT_THAT(result.complaints, SizeIs(1));
}

TEST_F(DecodeRows, OfACaptureWithoutMessagesSaySo)
{
    const Result result = decodeRows({write("empty.pcap", lteCapture())});
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(closingsOf(result), ElementsAre("empty.pcap empty 0 0"));
}

TEST_F(DecodeRows, OfWhatIsNoCaptureAreItsClosingRow)
{
    const Result result = decodeRows({path("missing.pcap")});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(closingsOf(result), ElementsAre("missing.pcap damaged 0 0"));
}

TEST_F(DecodeRows, AreThoseOfTheSelectedPaths)
{
    const Result result =
        decodeRows({"--select", "/**/Num*", "--select", "/Note", writeCells("cells.pcap")});
    EXPECT_THAT(valuesOf(result),
                Each(testing::AnyOf(HasSubstr("/Num Tx Antennas="), HasSubstr("/Note="))));
    EXPECT_THAT(closingsOf(result), SizeIs(1));
}

TEST_F(DecodeRows, AreTheStateAtSteps)
{
    PcapBytes capture = lteCapture();
    capture.record(captureStart, 0, cellInfoMessage(301));
    capture.record(captureStart, 900000, cellInfoMessage(302));
    capture.record(captureStart + 2, 0, cellInfoMessage(303));
    const Result result = decodeRows(
        {"--every", "1", "--select", "/**/Physical Cell ID", write("cells.pcap", capture)});
    EXPECT_THAT(valuesOf(result), ElementsAre("1 /Serving Cell Info/Physical Cell ID=302",
                                              "2 /Serving Cell Info/Physical Cell ID=303"));
}

TEST_F(DecodeRows, OfSeveralCapturesComeInTheirOrder)
{
    const Result result =
        decodeRows({writeCells("b.pcap"), writeDamaged("c.pcap"), write("a.pcap", lteCapture())});
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(closingsOf(result),
                ElementsAre(StartsWith("b.pcap ok 2 "), StartsWith("c.pcap damaged 1 "),
                            "a.pcap empty 0 0"));
    EXPECT_THAT(result.complaints, ElementsAre(HasSubstr("c.pcap: message 1")));
}

TEST_F(DecodeRows, OfSeveralCapturesAreStrictWhereThatIsAskedFor)
{
    const std::string good = writeCells("good.pcap");
    EXPECT_EQ(decodeRows({"--strict", good, good}).status, 0);
    EXPECT_EQ(decodeRows({"--strict", writeDamaged("bad.pcap"), good}).status, 1);
}

TEST_F(DecodeRows, HaveOneHeadingForAllCaptures)
{
    const std::string capture = writeCells("cells.pcap");
    const auto lines = linesOf(decode({"--format", "csv", capture, capture}).output);
    EXPECT_EQ(std::ranges::count_if(
                  lines, [](const std::string& line) { return line.starts_with("capture,"); }),
              1);
}

TEST_F(DecodeRows, OfADirectoryAreThoseOfItsCaptures)
{
    std::filesystem::create_directories(path("logs/day"));
    writeCells("logs/day/2.pcap");
    writeCells("logs/day/1.pcap");
    writeCells("logs/a.pcap");
    const Result result = decodeRows({path("logs")});
    EXPECT_THAT(closingsOf(result), ElementsAre(StartsWith("a.pcap ok"), StartsWith("1.pcap ok"),
                                                StartsWith("2.pcap ok")));
}

TEST_F(DecodeRows, OfAListAreThoseOfItsNames)
{
    const std::string names =
        writeFile("names", writeCells("a.pcap") + "\n" + path("missing") + "\n");
    const Result result = decodeRows({"--files-from", names});
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(closingsOf(result),
                ElementsAre(StartsWith("a.pcap ok"), StartsWith("missing damaged")));
}

TEST_F(DecodeRows, OfCapturesThatAreDecodedAtATimeAreTheSame)
{
    Arguments captures;
    for (int i = 0; i < 12; ++i)
        captures.push_back(i % 3 == 1 ? writeDamaged(fmt::format("{}.pcap", i))
                                      : writeCells(fmt::format("{}.pcap", i)));
    Arguments inJobs{"--jobs", "4"};
    inJobs.insert(inJobs.end(), captures.begin(), captures.end());
    const Result alone = decodeRows(captures);
    const Result beside = decodeRows(inJobs);
    EXPECT_EQ(beside.output, alone.output);
    EXPECT_EQ(beside.status, 0);
    EXPECT_THAT(beside.complaints, testing::UnorderedElementsAreArray(alone.complaints));
}

TEST_F(DecodeRows, OfADecoderThatIsKilledTellSoAndGoOn)
{
    const std::string pipe = path("pipe");
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
    const auto program =
        start("ventrik-decode",
              withResources({"--format", "rows", "--jobs", "2", pipe, writeCells("good.pcap")}));
    // The one that waits for the pipe to have a writer.
    std::string child;
    ASSERT_TRUE(waitUntil([&] {
        std::istringstream children(
            readFile(fmt::format("/proc/{0}/task/{0}/children", program->processId())));
        return static_cast<bool>(children >> child);
    }));
    ::kill(std::stoi(child), SIGKILL);
    const Result result = finish(*program);
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(closingsOf(result), ElementsAre("pipe damaged 0 0", StartsWith("good.pcap ok 2 ")));
    EXPECT_THAT(result.complaints, ElementsAre(HasSubstr("ended by signal 9 (Killed)")));
}

TEST_F(DecodeRows, ThatCannotBeWrittenEndTheRun)
{
    const std::string capture = writeCells("a.pcap");
    const auto shell = startInShell(
        "ventrik-decode", withResources({"--format", "rows", capture, capture}), "", ">/dev/full");
    EXPECT_EQ(shell->waitForEnd(), 1);
    EXPECT_THAT(shell->errors(), HasSubstr("No space left on device"));
}

TEST_F(DecodeRows, AreRefusedWhereOptionsDoNotGoTogether)
{
    const std::string capture = writeCells("a.pcap");
    const auto refusal = [&](const Arguments& arguments) {
        const Result result = decode(arguments);
        EXPECT_EQ(result.status, 2);
        return result.errors;
    };
    EXPECT_THAT(refusal({"--select", "/a", capture}), HasSubstr("--select goes with --format"));
    EXPECT_THAT(refusal({capture, capture}), HasSubstr("what is '"));
    EXPECT_THAT(refusal({"--format", "rows"}), HasSubstr("CAPTURE is required"));
    EXPECT_THAT(refusal({"--format", "rows", "--snapshot", "x", capture, capture}),
                HasSubstr("--snapshot goes with one capture"));
    EXPECT_THAT(refusal({"--format", "rows", "--jobs", "0", capture}), HasSubstr("not above 0"));
    EXPECT_THAT(refusal({"--format", "rows", "--every", "0", capture}), HasSubstr("'0'"));
}

TEST_F(DecodeRows, HaveASchemaThatNeedsNoCapture)
{
    const Result result = decode({"--schema"});
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, StartsWith("schema\t1\ncapture\ttext\t"));
}

TEST_F(DecodeRows, OfACaptureThatWasWrittenAreTheSame)
{
    const std::string capture = writeCells("cells.pcap");
    const auto valuesOfWritten = [&](const std::string& name) {
        const std::string written = path(name);
        EXPECT_EQ(decodeRows({"--write-capture", written, capture}).status, 0);
        return valuesOf(decodeRows({written}));
    };
    const auto values = valuesOf(decodeRows({capture}));
    EXPECT_THAT(values, Not(IsEmpty()));
    EXPECT_EQ(valuesOfWritten("again.pcap"), values);
    EXPECT_EQ(valuesOfWritten("again.pcapng"), values);
}

TEST_F(DecodeRows, OfACaptureThatCannotBeWrittenAreNone)
{
    const Result result =
        decodeRows({"--write-capture", "/nowhere/x.pcap", writeCells("cells.pcap")});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(result.complaints, ElementsAre(HasSubstr("/nowhere/x.pcap: No such file")));
}

} // namespace ventrik
