#include "Tests/Capture/SerialFrames.h"
#include "Tests/Process/EmulatedPhone.h"
#include "Tests/Process/LogChannelClient.h"
#include "Tests/Process/ProcessFixture.h"

#include <csignal>
#include <filesystem>
#include <random>

#include <QCoreApplication>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::HasSubstr;
using testing::SizeIs;

/// A service at a phone's port, with a client.
class SerialPortProcess : public ProcessFixture
{
  protected:
    ProgramPointer startSerial()
    {
        return startService({"--serial", device, "--technology", "lte", "--verbose"});
    }
    void openClient(const std::string& name = "org.ventrik.Test")
    {
        clients.push_back(std::make_unique<LogChannelClient>(runtimeDirectory(), name));
        ASSERT_TRUE(clients.back()->open());
        clients.back()->startStreaming({0xB000, 0xB00A});
    }
    const std::vector<Bytes>& received() const { return clients.front()->messages(); }
    bool receives(std::size_t count) const
    {
        return waitUntil([&] { return received().size() >= count; });
    }
    static bool isAsked(EmulatedPhone& phone)
    {
        return waitUntil([&] { return !phone.commands().empty(); });
    }
    static Bytes packetOf(const Bytes& record) { return ByteRow().number(1, 1).bytes(record); }

    const std::string device = path("phone");
    const Bytes maskCommand{0x73, 0, 0, 0, 3, 0, 0, 0, 0xB, 0, 0, 0, 11, 0, 0, 0, 1, 4};
    const Bytes disablingCommand{0x73, 0, 0, 0, 0, 0, 0, 0};
    const Bytes answer = frame({0x73, 0, 0, 0, 3, 0, 0, 0, 0, 0, 0, 0});
    const Bytes record = logRecord(0xB00A, stampIn2025(), {0x7E, 0x7D, 0x5E, 0x11, 0x13, 0x0D});
    std::vector<std::unique_ptr<LogChannelClient>> clients;
};

} // namespace

TEST_F(SerialPortProcess, AsksForTheCodesAndStreamsTheRecords)
{
    EmulatedPhone phone(device);
    const auto service = startSerial();
    openClient();
    ASSERT_TRUE(isAsked(phone)) << service->errors();
    EXPECT_THAT(phone.commands(), ElementsAre(maskCommand));
    EXPECT_TRUE(phone.send(joined({answer, logFrame(record), logFrame(record)})));
    EXPECT_TRUE(receives(2)) << service->errors();
    EXPECT_THAT(received(), ElementsAre(packetOf(record), packetOf(record)));
}

TEST_F(SerialPortProcess, StreamsEveryByteAsItIs)
{
    Bytes every(256);
    for (std::size_t i = 0; i < every.size(); ++i)
        every[i] = static_cast<std::uint8_t>(i);
    const Bytes full = logRecord(0xB000, stampIn2025(), every);
    EmulatedPhone phone(device);
    const auto service = startSerial();
    openClient();
    ASSERT_TRUE(isAsked(phone));
    EXPECT_TRUE(phone.send(logFrame(full)));
    EXPECT_TRUE(receives(1)) << service->errors();
    EXPECT_THAT(received(), ElementsAre(packetOf(full)));
}

TEST_F(SerialPortProcess, GivesItsRecordsToAllChannelsAndStopsWithTheLast)
{
    EmulatedPhone phone(device);
    const auto service = startSerial();
    openClient();
    openClient("org.ventrik.Other");
    ASSERT_TRUE(isAsked(phone));
    EXPECT_TRUE(waitUntil([&] {
        return linesOf(service->errors()).size() > 4 && service->says("Other: streaming");
    }));
    EXPECT_TRUE(phone.send(logFrame(record)));
    EXPECT_TRUE(waitUntil([&] { return clients[1]->messages().size() == 1; }));
    EXPECT_TRUE(receives(1));
    clients.clear();
    EXPECT_TRUE(waitUntil([&] { return phone.commands().back() == disablingCommand; }));
    EXPECT_THAT(phone.commands(), ElementsAre(maskCommand, disablingCommand));
}

TEST_F(SerialPortProcess, DisablesTheLogsWhenItEnds)
{
    EmulatedPhone phone(device);
    const auto service = startSerial();
    openClient();
    ASSERT_TRUE(isAsked(phone));
    service->send(SIGTERM);
    EXPECT_EQ(service->waitForEnd(), 0) << service->errors();
    EXPECT_THAT(phone.commands(), ElementsAre(maskCommand, disablingCommand));
}

TEST_F(SerialPortProcess, SaysThatThePhoneRefuses)
{
    EmulatedPhone phone(device);
    const auto service = startSerial();
    openClient();
    ASSERT_TRUE(isAsked(phone));
    EXPECT_TRUE(phone.send(frame(joined({{0x13}, phone.commands().front()}))));
    EXPECT_TRUE(waitUntil([&] {
        return service->says(device + " refuses to send logs: it answers 0x13\n");
    })) << service->errors();
    EXPECT_TRUE(service->isRunning());
}

TEST_F(SerialPortProcess, TellsViewersOfThePhone)
{
    EmulatedPhone phone(device);
    const auto service = startSerial();
    const auto viewer = start("ventrik-watch", {"--once", "--channel-pane"});
    ASSERT_TRUE(isAsked(phone));
    Bytes bad = logFrame(record);
    bad[6] ^= 1;
    const Bytes cellInfo = logRecord(0xB0C2, stampIn2025(), Bytes(25));
    EXPECT_TRUE(phone.send(joined({answer, bad, frame({0x4B, 1}), logFrame(cellInfo)})));
    ASSERT_EQ(viewer->waitForEnd(), 0) << viewer->errors();
    for (const char* row : {"Log Masks: set\n", "Log Records: 1\n", "Frames of Kind 0x4B: 1\n",
                            "Bad Checksums: 1, the first at offset ", "Messages: 1\n"})
        EXPECT_THAT(viewer->output(), HasSubstr(row));
}

TEST_F(SerialPortProcess, SaysThatThePhoneIsSilent)
{
    EmulatedPhone phone(device);
    const auto service = startSerial();
    openClient();
    EXPECT_TRUE(waitUntil([&] { return service->says(device + " does not answer\n"); }));
    EXPECT_TRUE(service->isRunning());
}

TEST_F(SerialPortProcess, FindsRecordsInNoiseAndTellsWhatElseCame)
{
    std::mt19937 random(1);
    Bytes noise(10000);
    for (std::uint8_t& byte : noise)
        byte = static_cast<std::uint8_t>(random());
    Bytes bad = logFrame(record);
    bad[6] ^= 1;
    EmulatedPhone phone(device);
    const auto service = startSerial();
    openClient();
    ASSERT_TRUE(isAsked(phone));
    EXPECT_TRUE(phone.send(
        joined({noise, {endMark}, bad, logFrame(record), frame({0x4B, 1}), logFrame(record)})));
    EXPECT_TRUE(receives(2)) << service->errors();
    service->send(SIGTERM);
    EXPECT_EQ(service->waitForEnd(), 0);
    EXPECT_THAT(received(), ElementsAre(packetOf(record), packetOf(record)));
    EXPECT_THAT(service->errors(), HasSubstr(" frames with a bad checksum, the first at offset "));
    EXPECT_THAT(service->errors(), HasSubstr(": 1 frame of kind 0x4B\n"));
}

TEST_F(SerialPortProcess, TakesFramesThatComeByteByByte)
{
    EmulatedPhone phone(device);
    const auto service = startSerial();
    openClient();
    ASSERT_TRUE(isAsked(phone));
    for (const std::uint8_t byte : logFrame(record)) {
        EXPECT_TRUE(phone.send({&byte, 1}));
        QCoreApplication::processEvents();
    }
    EXPECT_TRUE(receives(1)) << service->errors();
    EXPECT_THAT(received(), ElementsAre(packetOf(record)));
}

TEST_F(SerialPortProcess, StaysSmallWhateverComes)
{
    environment.insert("ASAN_OPTIONS", "quarantine_size_mb=1");
    constexpr long growthLimit = (isSanitized ? 32 : 8) * 1024; // KiB
    EmulatedPhone phone(device);
    const auto service = startSerial();
    openClient();
    ASSERT_TRUE(isAsked(phone));
    EXPECT_TRUE(phone.send(logFrame(record)));
    ASSERT_TRUE(receives(1));
    const long before = service->residentMemory();
    EXPECT_TRUE(phone.send(Bytes(std::size_t{24} << 20, 1)));
    EXPECT_TRUE(phone.send(joined({{endMark}, logFrame(record)})));
    EXPECT_TRUE(receives(2)) << service->errors();
    EXPECT_LT(service->peakMemory() - before, growthLimit);
}

TEST_F(SerialPortProcess, GoesOnWithAPhoneThatGoesAndComesBack)
{
    auto phone = std::make_unique<EmulatedPhone>(device);
    const auto service = startSerial();
    openClient();
    ASSERT_TRUE(isAsked(*phone));
    EXPECT_TRUE(phone->send(Bytes{0x10, 0, 1}));
    phone.reset();
    EXPECT_TRUE(waitUntil([&] { return service->says(device + " has gone"); }));
    phone = std::make_unique<EmulatedPhone>(device);
    ASSERT_TRUE(isAsked(*phone)) << service->errors();
    EXPECT_THAT(phone->commands(), ElementsAre(maskCommand));
    EXPECT_TRUE(phone->send(logFrame(record)));
    EXPECT_TRUE(receives(1)) << service->errors();
    EXPECT_THAT(received(), ElementsAre(packetOf(record)));
}

TEST_F(SerialPortProcess, WaitsForAPhoneThatIsNotThereYet)
{
    const auto service = startSerial();
    openClient();
    EXPECT_TRUE(waitUntil([&] {
        return service->says(device + " cannot be opened, and is tried again every 5 s: No such");
    })) << service->errors();
    EmulatedPhone phone(device);
    EXPECT_TRUE(isAsked(phone)) << service->errors();
}

TEST_F(SerialPortProcess, IsRefusedWhereTheDeviceIsNoPort)
{
    const auto service =
        startService({"--serial", "/dev/null", "--technology", "lte", "--verbose"});
    EXPECT_TRUE(waitUntil([&] { return service->says("/dev/null cannot be opened"); }))
        << service->errors();
    service->send(SIGTERM);
    EXPECT_EQ(service->waitForEnd(), 0);
}

} // namespace ventrik
