#include "Capture/CaptureWriter.h"
#include "Tests/Process/LTECaptures.h"
#include "Tests/Process/LogChannelClient.h"
#include "Tests/Process/ProcessFixture.h"

#include <csignal>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

class ReplayProcess : public ProcessFixture
{
  protected:
    /// A capture of numbered LTE measurements of that size, so far apart.
    std::string makeCapture(std::uint32_t count, std::size_t size, std::chrono::microseconds apart)
    {
        std::string error;
        const std::string file = path("large.pcap");
        auto writer = CaptureWriter::create(file, *technologyNamed("lte"), error);
        Clock::TimePoint time{std::chrono::seconds(captureStart)};
        for (std::uint32_t i = 0; i < count; ++i, time += apart)
            writer->write(time, message(i, size));
        EXPECT_TRUE(writer->commit(error)) << error;
        return file;
    }
    static Bytes message(std::uint32_t number, std::size_t size)
    {
        return PacketBuilder(0xB17F).u32(16, number).size(size).build();
    }
    static long droppedMessages(const Program& service)
    {
        // The last of "… does not keep up, N messages dropped so far".
        constexpr std::string_view before = "does not keep up, ";
        const auto at = service.errors().rfind(before);
        if (at == std::string::npos)
            return 0;
        return std::atol(service.errors().c_str() + at + before.size());
    }
};

} // namespace

TEST_F(ReplayProcess, WithoutPaceLosesNothing)
{
    constexpr std::uint32_t count = 20000;
    const std::string file = makeCapture(count, 64, 100us);
    const auto service = startService({"--replay", file, "--speed", "max"});
    LogChannelClient client(runtimeDirectory(), "org.ventrik.Test");
    ASSERT_TRUE(client.open());
    client.startStreaming();
    EXPECT_TRUE(waitUntil([&] { return client.messages().size() >= count; }));
    ASSERT_EQ(client.messages().size(), count);
    for (std::uint32_t i = 0; i < count; ++i)
        ASSERT_EQ(client.messages()[i], message(i, 64)) << i;
}

TEST_F(ReplayProcess, DropsTheOldestMessagesOfAStoppedViewerAndStaysSmall)
{
    // Freed memory counts as used in the sanitizers' quarantine, if that is not kept small.
    environment.insert("ASAN_OPTIONS", "quarantine_size_mb=1");
    constexpr long growthLimit = (isSanitized ? 64 : 32) * 1024; // KiB
    const std::string file = makeCapture(20000, 2048, 100us);
    const auto service = startService({"--replay", file, "--verbose"});
    const auto watch = start("ventrik-watch", {"--verbose"});
    ASSERT_TRUE(waitUntil([&] { return watch->says("Starting the display update timer"); }));
    watch->send(SIGSTOP);
    const long before = service->residentMemory();

    // 40 MB in 2 s; about 1000 messages wait in the queue and fewer than 500 in the socket.
    EXPECT_TRUE(waitUntil([&] { return droppedMessages(*service) > 10000; }));
    EXPECT_TRUE(service->isRunning());
    EXPECT_GT(before, 0);
    EXPECT_LT(service->peakMemory() - before, growthLimit);

    const std::size_t shownBefore = watch->output().size();
    watch->send(SIGCONT);
    EXPECT_TRUE(waitUntil([&] {
        return watch->output().find("Serving Cell Measurements", shownBefore) != std::string::npos;
    }));
    EXPECT_TRUE(service->isRunning());
}

TEST_F(ReplayProcess, WithoutPaceEndsInTheTreeThatDecodingGives)
{
    for (const std::string technology : {"lte", "gsm", "utran", "c2k", "ifx"}) {
        const std::string file = path(technology + ".pcap");
        const auto writing = start(
            "ventrik-telephony", {"--technology", technology, "--write", file, "--count", "1000"});
        EXPECT_EQ(writing->waitForEnd(), 0) << writing->errors();
        const auto decode = start("ventrik-decode", {file});
        EXPECT_EQ(decode->waitForEnd(), 0) << decode->errors();
        const auto service = startService({"--replay", file, "--speed", "max"});
        const auto watch = start("ventrik-watch", {});
        EXPECT_TRUE(waitUntil([&] { return watch->output().ends_with(decode->output()); }))
            << decode->output() << "\n---\n"
            << watch->output();
    }
}

TEST_F(ReplayProcess, TakesTheTechnologyThatIsNamedWhereTheCaptureTellsNone)
{
    const Bytes untold = PcapBytes(1).record(captureStart, 0, cellInfoMessage(7)).bytes();
    const std::string file = writeFile("untold.pcap", untold);
    const auto refused = start("ventrik-telephony", {"--replay", file});
    EXPECT_EQ(refused->waitForEnd(), 1);
    EXPECT_THAT(linesOf(refused->errors()),
                testing::ElementsAre("ventrik-telephony: " + file +
                                     ": link type 1 names no technology; say which with "
                                     "--technology"));
    const auto service = startService({"--replay", file, "--technology", "lte"});
    const auto watch = start("ventrik-watch", {"--once"});
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
    EXPECT_TRUE(watch->prints("Physical Cell ID: 7\n")) << watch->output();
}

TEST_F(ReplayProcess, OfADamagedFileIsRefusedAtTheStart)
{
    const std::string file = writeFile("no.pcap", "no capture at all, but long enough for one");
    const auto service = start("ventrik-telephony", {"--replay", file});
    EXPECT_EQ(service->waitForEnd(), 1);
    EXPECT_THAT(linesOf(service->errors()),
                testing::ElementsAre(testing::StartsWith("ventrik-telephony: " + file)));
}

} // namespace ventrik
