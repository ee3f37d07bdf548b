#include "Capture/SerialStream.h"
#include "Tests/Capture/ContainerReading.h"
#include "Tests/Capture/SerialFrames.h"

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;

Bytes badFrame(const Bytes& content)
{
    const Bytes whole = ByteRow().bytes(content).number(2, frameChecksum(content) ^ 1);
    return ByteRow().bytes(escaped(whole)).number(1, endMark);
}

Bytes packetOf(const Bytes& record)
{
    return ByteRow().number(1, 1).bytes(record);
}

const Bytes firstRecord = logRecord(0xB193, stampIn2025(), {0x7E, 0x7D, 0x5E, 0});
const Bytes secondRecord = logRecord(0xB17F, stampIn2025(1), Bytes(40, 0x7E));

ContainerReading read(const Bytes& bytes)
{
    return readAll<SerialStream>(bytes);
}

bool isSerialStream(const Bytes& bytes)
{
    return SerialStream::isIn(bytes);
}

// All kinds of frames, and all kinds of damage.
Bytes mixedStream()
{
    return joined({{1, 2, 3, endMark},
                   logFrame(firstRecord),
                   {endMark, endMark},
                   frame({0x4B, 1, 2}),
                   badFrame({0x10, 1}),
                   frame(wrapped(2, logContent(secondRecord))),
                   frame(wrapped(2, {})),
                   logFrame(logRecord(0xB193, stampIn2025(), {}, 11)),
                   logFrame(firstRecord),
                   {0x10, 0, 1}});
}

} // namespace

TEST(FrameChecksum, IsThatOfTheKnownVector)
{
    EXPECT_EQ(frameChecksum(Bytes{'1', '2', '3', '4', '5', '6', '7', '8', '9'}), 0x906E);
}

TEST(HdlcFrame, IsWrittenEscapedWithItsChecksumAndItsEndMark)
{
    EXPECT_EQ(hdlcFrame(Bytes{'1', '2', '3', '4', '5', '6', '7', '8', '9'}),
              (Bytes{'1', '2', '3', '4', '5', '6', '7', '8', '9', 0x6E, 0x90, 0x7E}));
    const Bytes marks{0x7E, 1, 0x7D};
    EXPECT_EQ(hdlcFrame(marks), frame(marks));
}

TEST(FrameAssembler, GivesTheSameFramesWhereverTheirBytesAreParted)
{
    const Bytes bytes = joined({frame({0x7D, 1}), {5, endMark}, frame({0x7E})});
    FrameAssembler assembler;
    std::vector<Bytes> contents;
    for (const std::uint8_t byte : bytes) {
        EXPECT_EQ(assembler.take({&byte, 1}), 1U);
        if (const auto whole = assembler.frame())
            contents.emplace_back(whole->content.begin(), whole->content.end());
    }
    EXPECT_THAT(contents, ElementsAre(Bytes{0x7D, 1}, Bytes{0x7E}));
}

TEST(FrameAssembler, TakesNothingBehindAnEndMark)
{
    FrameAssembler assembler;
    const Bytes first = frame({1});
    EXPECT_EQ(assembler.take(joined({first, frame({2})})), first.size());
    EXPECT_EQ(assembler.frame()->content[0], 1);
}

TEST(FrameAssembler, CountsWhatWasBegunWhenTheBytesEndAndBeginsAnew)
{
    FrameAssembler assembler;
    assembler.take(Bytes{1, 2});
    assembler.end();
    assembler.end();
    std::vector<std::string> notes;
    assembler.tell(notes, "x");
    EXPECT_THAT(notes, ElementsAre("x: 1 unfinished frame at the end, the first at offset 0"));
    assembler.take(frame({7}));
    EXPECT_TRUE(assembler.frame());
}

TEST(SerialStream, GivesALogRecordAsAPacketOfTypeOne)
{
    const auto reading = read(logFrame(firstRecord));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(firstRecord)));
    EXPECT_EQ(reading.error, "");
    EXPECT_THAT(reading.notes, IsEmpty());
}

TEST(SerialStream, ReadsFramesThatAreEscapedInEveryByte)
{
    Bytes everyByte(256);
    for (std::size_t i = 0; i < everyByte.size(); ++i)
        everyByte[i] = static_cast<std::uint8_t>(i);
    const Bytes record = logRecord(1, stampIn2025(), everyByte);
    EXPECT_THAT(read(logFrame(record)).packets(), ElementsAre(packetOf(record)));
}

TEST(SerialStream, LeavesOutWhatStandsBehindTheRecord)
{
    const Bytes content = joined({logContent(firstRecord), {9, 9, 9}});
    EXPECT_THAT(read(frame(content)).packets(), ElementsAre(packetOf(firstRecord)));
}

TEST(SerialStream, TimesAPacketByItsTimestamp)
{
    const auto reading = read(logFrame(firstRecord));
    ASSERT_EQ(reading.messages.size(), 1U);
    EXPECT_EQ(reading.messages[0].time, timeAt(stampIn2025()));
}

TEST(SerialStream, TimesAPacketWithoutATellableTimestampByTheLastOne)
{
    const Bytes untold = logRecord(1, UINT64_MAX, {});
    const auto reading = read(joined({logFrame(untold), logFrame(secondRecord), logFrame(untold)}));
    ASSERT_EQ(reading.messages.size(), 3U);
    EXPECT_EQ(reading.messages[0].time, Clock::TimePoint());
    EXPECT_EQ(reading.messages[2].time, timeAt(stampIn2025(1)));
}

TEST(SerialStream, UnwrapsTheFramesOfASubscription)
{
    const auto reading =
        read(joined({frame(wrapped(0x01020304, logContent(firstRecord))), logFrame(secondRecord)}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(firstRecord), packetOf(secondRecord)));
    EXPECT_EQ(reading.messages.at(0).subscription, 0x01020304U);
    EXPECT_EQ(reading.messages.at(1).subscription, std::nullopt);
}

TEST(SerialStream, CountsAWrappingWithoutContent)
{
    const auto reading = read(joined({frame(wrapped(1, {})), frame({0x98})}));
    EXPECT_THAT(reading.packets(), IsEmpty());
    EXPECT_THAT(
        reading.notes,
        ElementsAre("x: 2 frames of a subscription without content, the first at offset 0"));
}

TEST(SerialStream, CountsFramesOfOtherKindsByTheirFirstByte)
{
    const auto reading =
        read(joined({frame({0x4B, 1}), frame({0x1D}), frame(wrapped(1, {0x4B})), frame({0x4B})}));
    EXPECT_THAT(reading.packets(), IsEmpty());
    EXPECT_THAT(reading.notes, ElementsAre("x: 1 frame of kind 0x1D", "x: 3 frames of kind 0x4B"));
}

TEST(SerialStream, SkipsRecordsThatAreShorterThanTheySay)
{
    const Bytes tooLong = logRecord(1, stampIn2025(), {1}, 14);
    const Bytes tooShort = logRecord(1, stampIn2025(), {1}, 11);
    const auto reading = read(joined(
        {logFrame(tooLong), logFrame(tooShort), frame({0x10, 0, 0}), logFrame(firstRecord)}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(firstRecord)));
    EXPECT_THAT(reading.notes,
                ElementsAre("x: 3 log records of a wrong length, the first at offset 0"));
}

TEST(SerialStream, TakesARecordWithoutPayload)
{
    const Bytes record = logRecord(1, stampIn2025(), {});
    EXPECT_THAT(read(logFrame(record)).packets(), ElementsAre(packetOf(record)));
}

TEST(SerialStream, SkipsFramesWithABadChecksumAndCountsThem)
{
    const Bytes good = logFrame(firstRecord);
    const Bytes bad = badFrame(logContent(secondRecord));
    const auto reading = read(joined({good, bad, bad, good}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(firstRecord), packetOf(firstRecord)));
    EXPECT_THAT(reading.notes, ElementsAre("x: 2 frames with a bad checksum, the first at offset " +
                                           std::to_string(good.size())));
}

TEST(SerialStream, CountsAFrameThatEndsInAnEscapeAsBad)
{
    Bytes aborted = logFrame(firstRecord);
    aborted.insert(aborted.end() - 1, 0x7D);
    const auto reading = read(joined({aborted, logFrame(secondRecord)}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(secondRecord)));
    EXPECT_THAT(reading.notes,
                ElementsAre("x: 1 frame with a bad checksum, the first at offset 0"));
}

TEST(SerialStream, TakesNoNoticeOfEmptyFrames)
{
    const auto reading = read(joined({{endMark, endMark}, logFrame(firstRecord), {endMark}}));
    EXPECT_EQ(reading.messages.size(), 1U);
    EXPECT_THAT(reading.notes, IsEmpty());
}

TEST(SerialStream, CountsJunkBetweenFrames)
{
    const auto reading = read(joined({{1, endMark}, logFrame(firstRecord), {1, 2, endMark}}));
    EXPECT_EQ(reading.messages.size(), 1U);
    EXPECT_THAT(reading.notes,
                ElementsAre("x: 2 pieces of junk between frames, the first at offset 0"));
}

TEST(SerialStream, CountsAnUnfinishedLastFrame)
{
    const Bytes good = logFrame(firstRecord);
    Bytes cut = logFrame(secondRecord);
    cut.pop_back();
    const auto reading = read(joined({good, cut}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(firstRecord)));
    EXPECT_THAT(reading.notes,
                ElementsAre("x: 1 unfinished frame at the end, the first at offset " +
                            std::to_string(good.size())));
}

TEST(SerialStream, TakesAFrameOfOneMebibyteAndNoneAbove)
{
    Bytes largest = ByteRow().bytes(logContent(firstRecord));
    largest.resize(FrameAssembler::maximumSize - 2);
    Bytes tooLarge = largest;
    tooLarge.push_back(0);
    const Bytes first = frame(largest);
    const auto reading = read(joined({first, frame(tooLarge), logFrame(secondRecord)}));
    EXPECT_THAT(reading.packets(), ElementsAre(packetOf(firstRecord), packetOf(secondRecord)));
    EXPECT_THAT(reading.notes, ElementsAre("x: 1 frame above 1 MiB, the first at offset " +
                                           std::to_string(first.size())));
}

TEST(SerialStream, TellsWhyTheBytesEndBeforeTheirTime)
{
    SerialStream stream(
        std::make_unique<ByteSource>([](std::span<std::uint8_t>, std::string& error) {
            error = "x: damaged";
            return std::size_t{0};
        }),
        "x");
    EXPECT_FALSE(stream.next());
    EXPECT_EQ(stream.error(), "x: damaged");
}

TEST(SerialStream, ReadsTheSameInBlocksOfAnySize)
{
    EXPECT_EQ(read(mixedStream()).messages.size(), 3U);
    EXPECT_EQ(read(mixedStream()).notes.size(), 5U);
    expectTheSameInBlocks<SerialStream>(mixedStream());
}

TEST(SerialStream, GivesTheFirstMessagesWhereverItIsCut)
{
    expectPrefixesOfMessages<SerialStream>(mixedStream());
}

TEST(SerialStream, RandomBytesAreHarmless)
{
    expectRandomBytesHarmless<SerialStream>(mixedStream());
}

TEST(SerialStream, IsToldByAFrameWithARightChecksum)
{
    EXPECT_TRUE(isSerialStream(frame({0})));
    EXPECT_TRUE(isSerialStream(joined({{1, 2, 3, endMark}, logFrame(firstRecord)})));
}

TEST(SerialStream, IsNotToldByAnythingElse)
{
    EXPECT_FALSE(isSerialStream({}));
    EXPECT_FALSE(isSerialStream({endMark, endMark}));
    EXPECT_FALSE(isSerialStream(frame({})));
    EXPECT_FALSE(isSerialStream(badFrame({0x10, 1, 2})));
    Bytes unfinished = logFrame(firstRecord);
    unfinished.pop_back();
    EXPECT_FALSE(isSerialStream(unfinished));
}

} // namespace ventrik
