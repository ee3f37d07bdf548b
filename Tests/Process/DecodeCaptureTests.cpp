#include "Tests/Capture/SerialFrames.h"
#include "Tests/Process/DecodeFixture.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

/// Captures that others made.
class DecodeCapture : public DecodeFixture
{
  protected:
    Result decodeBytes(const Bytes& bytes, Arguments arguments = {}) const
    {
        arguments.push_back(writeFile("capture", bytes));
        return decode(arguments);
    }
};

// A cell info without its type byte, of a moment in 2025: what a log record is.
Bytes cellRecord(std::uint16_t physicalCellId, std::uint64_t seconds = 0)
{
    const Bytes message = cellInfoMessage(physicalCellId);
    return logRecord(0xB0C2, stampIn2025(seconds), Bytes(message.begin() + 13, message.end()));
}

Bytes subscribed(std::uint32_t subscription, const Bytes& record)
{
    return frame(wrapped(subscription, logContent(record)));
}

} // namespace

TEST_F(DecodeCapture, OfASerialPortShowsItsRecords)
{
    const Result result = decodeBytes(logFrame(cellRecord(301)));
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, HasSubstr("Physical Cell ID: 301\n"));
    EXPECT_THAT(result.complaints, ElementsAre(HasSubstr("by its records it is of lte")));
}

TEST_F(DecodeCapture, OfRecordsShowsThem)
{
    const Result result = decodeBytes(joined({cellRecord(301), cellRecord(302, 1)}));
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, HasSubstr("Physical Cell ID: 302\n"));
}

TEST_F(DecodeCapture, ATechnologyThatIsNamedIsNotGuessed)
{
    const Result result = decodeBytes(cellRecord(301), {"--technology", "lte"});
    EXPECT_THAT(result.complaints, IsEmpty());
    EXPECT_THAT(result.output, HasSubstr("Physical Cell ID: 301\n"));
}

TEST_F(DecodeCapture, ATechnologyThatNoRecordTellsHasToBeNamed)
{
    const Result result = decodeBytes(logRecord(0xB0C3, stampIn2025(), {1}));
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.complaints, ElementsAre(HasSubstr("say which with --technology")));
}

TEST_F(DecodeCapture, OneSubscriptionCanBeKept)
{
    const Bytes stream =
        joined({subscribed(1, cellRecord(301)), subscribed(2, cellRecord(302, 1))});
    EXPECT_THAT(decodeBytes(stream).output, HasSubstr("Physical Cell ID: 302\n"));
    EXPECT_THAT(decodeBytes(stream, {"--subscription", "1"}).output,
                HasSubstr("Physical Cell ID: 301\n"));
}

TEST_F(DecodeCapture, DamageThatIsSkippedIsToldOnce)
{
    Bytes damaged = logFrame(cellRecord(302));
    damaged[10] ^= 1;
    const Result result = decodeBytes(joined({logFrame(cellRecord(301)), damaged, damaged}));
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, HasSubstr("Physical Cell ID: 301\n"));
    ASSERT_EQ(result.complaints.size(), 2U);
    EXPECT_THAT(result.complaints[1], HasSubstr("2 frames with a bad checksum"));
}

TEST_F(DecodeCapture, ASnapshotShowsWhatWasSaved)
{
    const std::string snapshot = path("saved.ventrik");
    decode(cellCapture(), {"--snapshot", snapshot});
    const Result result = decode({snapshot});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_THAT(result.output, HasSubstr("Num Tx Antennas: 2\n    Physical Cell ID: 301\n"));
}

TEST_F(DecodeCapture, TheServiceReplaysWhatASerialPortSent)
{
    const auto service = startReplay("port.hdlc", logFrame(cellRecord(301)));
    const auto watch = start("ventrik-watch", {"--once"});
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
    EXPECT_THAT(watch->output(), HasSubstr("Physical Cell ID: 301\n"));
}

} // namespace ventrik
