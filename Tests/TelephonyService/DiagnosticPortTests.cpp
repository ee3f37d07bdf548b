#include "TelephonyService/DiagnosticPort.h"

#include "Tests/Capture/SerialFrames.h"
#include "Tests/Support/CapturingSystemLog.h"
#include "Tests/Support/FakeSerialPorts.h"
#include "Tests/Support/ManualMainQueue.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

class DiagnosticPortTest : public testing::Test
{
  protected:
    /// A channel that wants these codes, and what it gets.
    struct Channel {
        Channel(DiagnosticPort& port, const PlistArray& codes, const PlistArray& extraCodes = {})
            : source(port.makeSource())
        {
            source->start(WantedCodes(PlistDictionary{{"SetOrbelLogCodes", codes},
                                                      {"SetQxExtraCodes", extraCodes}}),
                          [this](ByteView message) {
                              received.emplace_back(message.begin(), message.end());
                          });
        }
        std::vector<Bytes> received;
        std::unique_ptr<MessageSource> source;
    };

    static LogMasks masksOf(std::initializer_list<std::uint16_t> codes)
    {
        LogMasks masks;
        for (const std::uint16_t code : codes)
            masks.add(code);
        return masks;
    }
    // The commands that were written since the last call.
    std::vector<Bytes> commands()
    {
        queue.run();
        return std::exchange(ports.written, {});
    }
    static Bytes packetOf(const Bytes& record) { return ByteRow().number(1, 1).bytes(record); }

    const Bytes record = logRecord(0xB193, stampIn2025(), {0x7E, 0x7D, 0x5E, 0});
    ManualMainQueue queue;
    FakeSerialPorts ports;
    CapturingSystemLog log;
    std::unique_ptr<DiagnosticPort> port =
        std::make_unique<DiagnosticPort>(queue, ports, log, "/dev/phone");
};

} // namespace

TEST_F(DiagnosticPortTest, AsksForNothingBeforeAChannelStreams)
{
    port->open();
    EXPECT_TRUE(port->isOpen());
    EXPECT_THAT(commands(), IsEmpty());
}

TEST_F(DiagnosticPortTest, AsksForTheCodesThatAChannelWants)
{
    port->open();
    const Channel channel(*port, {0xB193, 0xB0C0, 0x1003});
    EXPECT_EQ(commands(), masksOf({0xB193, 0xB0C0, 0x1003}).commandsFrom({}));
}

TEST_F(DiagnosticPortTest, SaysHowManyCodesItCannotAskFor)
{
    port->open();
    const Channel channel(*port, {0xB193, 0x1B193}, {0, 1});
    EXPECT_EQ(commands(), masksOf({0xB193}).commandsFrom({}));
    EXPECT_TRUE(
        log.contains("/dev/phone: 3 of the codes are no log codes and cannot be asked for there"));
}

TEST_F(DiagnosticPortTest, AsksForWhatAnyChannelWants)
{
    port->open();
    const Channel first(*port, {0xB193});
    auto second = std::make_unique<Channel>(*port, PlistArray{0xB193, 0xB0C0});
    EXPECT_EQ(commands(), masksOf({0xB193, 0xB0C0}).commandsFrom({}));
    const Channel third(*port, {0xB0C0});
    EXPECT_THAT(commands(), IsEmpty());
    second.reset();
    EXPECT_THAT(commands(), IsEmpty());
}

TEST_F(DiagnosticPortTest, DisablesWhatIsWantedNoMoreWhenAChannelLeaves)
{
    port->open();
    const Channel first(*port, {0xB193});
    auto second = std::make_unique<Channel>(*port, PlistArray{0xB0C0});
    commands();
    second.reset();
    EXPECT_EQ(commands(), masksOf({0xB193}).commandsFrom(masksOf({0xB193, 0xB0C0})));
}

TEST_F(DiagnosticPortTest, DisablesAllWhenNoChannelIsLeft)
{
    port->open();
    auto channel = std::make_unique<Channel>(*port, PlistArray{0xB193});
    commands();
    channel.reset();
    EXPECT_THAT(commands(), ElementsAre(LogMasks::disablingCommand()));
}

TEST_F(DiagnosticPortTest, IsLeftAloneByAChannelThatBeginsAnew)
{
    port->open();
    auto channel = std::make_unique<Channel>(*port, PlistArray{0xB193});
    commands();
    channel.reset();
    channel = std::make_unique<Channel>(*port, PlistArray{0xB193});
    EXPECT_THAT(commands(), IsEmpty());
}

TEST_F(DiagnosticPortTest, DisablesAllAtItsEndAndWaitsForThat)
{
    port->open();
    // A channel that is there to the end; its source may not outlive the port.
    auto channel = std::make_unique<Channel>(*port, PlistArray{0xB193});
    commands();
    channel.reset();
    port.reset();
    EXPECT_THAT(commands(), ElementsAre(LogMasks::disablingCommand()));
    EXPECT_EQ(ports.flushes, 1);
    EXPECT_FALSE(ports.isOpen());
}

TEST_F(DiagnosticPortTest, WaitsAtItsEndForWhatTheLastChannelsLeavingWrote)
{
    port->open();
    {
        const Channel channel(*port, {0xB193});
        queue.run();
    }
    queue.run();
    ASSERT_EQ(ports.flushes, 0);
    port.reset();
    EXPECT_EQ(ports.flushes, 1);
    EXPECT_EQ(ports.written.back(), LogMasks::disablingCommand());
}

TEST_F(DiagnosticPortTest, GivesEachRecordToAllChannels)
{
    port->open();
    const Channel first(*port, {0xB193});
    const Channel second(*port, {0xB193});
    ports.send(frame(wrapped(1, logContent(record))));
    EXPECT_THAT(first.received, ElementsAre(packetOf(record)));
    EXPECT_THAT(second.received, ElementsAre(packetOf(record)));
}

TEST_F(DiagnosticPortTest, PutsFramesTogetherThatComeByteByByte)
{
    port->open();
    const Channel channel(*port, {0xB193});
    for (const std::uint8_t byte : logFrame(record))
        ports.send({&byte, 1});
    EXPECT_THAT(channel.received, ElementsAre(packetOf(record)));
}

TEST_F(DiagnosticPortTest, IsTriedAgainEveryFiveSecondsWhereItIsNotThereAndSaysSoOnce)
{
    ports.fault = "No such file or directory";
    port->open();
    queue.advance(14999ms);
    EXPECT_EQ(ports.attempts.size(), 3U);
    EXPECT_EQ(log.texts(LogPriority::error),
              std::vector<std::string>{"/dev/phone cannot be opened, and is tried again every 5 s: "
                                       "No such file or directory"});
    ports.fault = "Permission denied";
    queue.advance(1ms);
    EXPECT_EQ(log.texts(LogPriority::error).size(), 2U);
}

TEST_F(DiagnosticPortTest, SaysAgainWhyItCannotBeOpenedOnceItWasOpen)
{
    ports.fault = "No such file or directory";
    port->open();
    ports.fault.clear();
    queue.advance(5s);
    ASSERT_TRUE(ports.isOpen());
    ports.fault = "No such file or directory";
    ports.lose("Input/output error");
    log.clear();
    queue.advance(10s);
    EXPECT_THAT(log.texts(LogPriority::error),
                ElementsAre("/dev/phone cannot be opened, and is tried again every 5 s: "
                            "No such file or directory"));
}

TEST_F(DiagnosticPortTest, SetsTheMasksAgainWhenItComesBack)
{
    port->open();
    const Channel channel(*port, {0xB193});
    const auto first = commands();
    ports.lose("Input/output error");
    queue.advance(4999ms);
    EXPECT_FALSE(ports.isOpen());
    EXPECT_THAT(commands(), IsEmpty());
    queue.advance(1ms);
    EXPECT_TRUE(ports.isOpen());
    EXPECT_EQ(commands(), first);
    ports.send(logFrame(record));
    EXPECT_EQ(channel.received.size(), 1U);
}

TEST_F(DiagnosticPortTest, SaysOnceThatItHasGoneAndWhatItSentBesideRecords)
{
    port->open();
    ports.send(joined({{1, endMark}, frame({0x4B}), logFrame(record), {0x10, 0}}));
    ports.lose("Input/output error");
    queue.advance(4s);
    EXPECT_THAT(log.texts(LogPriority::error),
                ElementsAre("/dev/phone has gone, and is tried again every 5 s: Input/output error",
                            "/dev/phone: 1 piece of junk between frames, the first at offset 0",
                            testing::StartsWith(
                                "/dev/phone: 1 unfinished frame at the end, the first at offset "),
                            "/dev/phone: 1 frame of kind 0x4B"));
}

TEST_F(DiagnosticPortTest, ForgetsAFrameThatWasBegunBeforeItWent)
{
    port->open();
    const Channel channel(*port, {0xB193});
    ports.send(Bytes{0x10, 0});
    ports.lose("Input/output error");
    queue.advance(5s);
    ports.send(logFrame(record));
    EXPECT_EQ(channel.received.size(), 1U);
}

TEST_F(DiagnosticPortTest, TellsItsCountsAtItsEnd)
{
    port->open();
    ports.send(frame({0x4B}));
    port.reset();
    EXPECT_TRUE(log.contains("/dev/phone: 1 frame of kind 0x4B"));
}

TEST_F(DiagnosticPortTest, SaysOnceThatItRefuses)
{
    for (const std::uint8_t answer : Bytes{0x13, 0x14, 0x15}) {
        log.clear();
        port = std::make_unique<DiagnosticPort>(queue, ports, log, "/dev/phone");
        port->open();
        ports.send(frame({answer, 0x73}));
        ports.send(frame({answer, 0x73}));
        EXPECT_THAT(log.texts(LogPriority::error),
                    ElementsAre(fmt::format("/dev/phone refuses to send logs: it answers 0x{:02X}",
                                            answer)));
    }
}

TEST_F(DiagnosticPortTest, SaysThatAMaskWasNotSet)
{
    port->open();
    ports.send(frame({0x73, 0, 0, 0, 3, 0, 0, 0, 0, 0, 0, 0}));
    EXPECT_THAT(log.texts(LogPriority::error), IsEmpty());
    ports.send(frame({0x73, 0, 0, 0, 3, 0, 0, 0, 2, 0, 0, 0}));
    EXPECT_THAT(log.texts(LogPriority::error),
                ElementsAre("/dev/phone refuses to send logs: status 2"));
}

TEST_F(DiagnosticPortTest, SaysThatItDoesNotAnswer)
{
    port->open();
    const Channel channel(*port, {0xB193});
    queue.advance(4999ms);
    EXPECT_THAT(log.texts(LogPriority::error), IsEmpty());
    queue.advance(20s);
    EXPECT_THAT(log.texts(LogPriority::error), ElementsAre("/dev/phone does not answer"));
}

TEST_F(DiagnosticPortTest, AnswersWithAnyFrame)
{
    port->open();
    const Channel channel(*port, {0xB193});
    ports.send(frame({0x73, 0, 0, 0, 3, 0, 0, 0, 0, 0, 0, 0}));
    queue.advance(20s);
    EXPECT_THAT(log.texts(LogPriority::error), IsEmpty());
}

TEST_F(DiagnosticPortTest, ReportsThatItIsNotThereAndWhy)
{
    ports.fault = "No such file or directory";
    port->open();
    EXPECT_EQ(port->makeSource()->report(),
              (PlistDictionary{{"Device", "/dev/phone"}, {"State", "No such file or directory"}}));
}

TEST_F(DiagnosticPortTest, ReportsWhetherItsMasksAreSet)
{
    const auto masks = [this] { return *port->makeSource()->report().find("Log Masks"); };
    port->open();
    EXPECT_EQ(masks(), "not asked for");
    const Channel channel(*port, {0xB193});
    queue.run();
    EXPECT_EQ(masks(), "asked for, not answered yet");
    ports.send(frame({0x73, 0, 0, 0, 3, 0, 0, 0, 0, 0, 0, 0}));
    EXPECT_EQ(masks(), "set");
    ports.send(frame({0x13, 0x73}));
    EXPECT_EQ(masks(), "refused: it answers 0x13");
}

TEST_F(DiagnosticPortTest, ReportsItsFramesByKindAndThoseWithABadChecksum)
{
    Bytes bad = logFrame(record);
    bad[6] ^= 1;
    const Bytes other = frame({0x4B, 1});
    port->open();
    ports.send(joined({logFrame(record), bad, other, logFrame(record)}));
    const PlistDictionary report = port->makeSource()->report();
    EXPECT_EQ(*report.find("State"), "open");
    EXPECT_EQ(*report.find("Log Records"), "2");
    EXPECT_EQ(*report.find("Bad Checksums"),
              fmt::format("1, the first at offset {}", logFrame(record).size()));
    EXPECT_EQ(*report.find("Frames of Kind 0x4B"), "1");
    EXPECT_EQ(*report.find("Bytes Received"),
              fmt::format("{}", 2 * logFrame(record).size() + bad.size() + other.size()));
}

TEST_F(DiagnosticPortTest, ReportsThatItHasGone)
{
    port->open();
    ports.lose("Input/output error");
    EXPECT_EQ(*port->makeSource()->report().find("State"), "has gone: Input/output error");
}

TEST_F(DiagnosticPortTest, KeepsNoFrameWithoutEnd)
{
    port->open();
    const Channel channel(*port, {0xB193});
    const Bytes endless(std::size_t{1} << 20, 1);
    for (int i = 0; i < 8; ++i)
        ports.send(endless);
    ports.send(joined({{endMark}, logFrame(record)}));
    EXPECT_EQ(channel.received.size(), 1U);
    ports.lose("Input/output error");
    EXPECT_TRUE(log.contains("/dev/phone: 1 frame above 1 MiB, the first at offset 0"));
}

TEST_F(DiagnosticPortTest, DoesNothingMoreWhenItHasGone)
{
    ports.fault = "No such file or directory";
    port->open();
    port.reset();
    queue.advance(20s);
    EXPECT_EQ(ports.attempts.size(), 1U);
}

} // namespace ventrik
