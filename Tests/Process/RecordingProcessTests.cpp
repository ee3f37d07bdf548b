#include "Capture/CaptureReader.h"
#include "Tests/Process/LogChannelClient.h"
#include "Tests/Process/ProcessFixture.h"

#include <csignal>
#include <filesystem>

#include <sys/stat.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::HasSubstr;

constexpr const char* timerStarted = "Starting the display update timer";

class RecordingProcess : public ProcessFixture
{
  protected:
    /// A service whose drive has pauses of its own.
    ProgramPointer startDrive() { return startService({"--technology", "lte", "--verbose"}); }
    ProgramPointer startWatch(Arguments arguments)
    {
        arguments.push_back("--verbose");
        return start("ventrik-watch", arguments);
    }
    std::string decoded(const std::string& capture)
    {
        const auto decode = start("ventrik-decode", {capture});
        EXPECT_EQ(decode->waitForEnd(), 0) << decode->errors();
        return decode->output();
    }
    static std::vector<Bytes> messagesIn(const std::string& capture)
    {
        std::vector<Bytes> messages;
        std::string error;
        auto reader = CaptureReader::open(capture, error);
        EXPECT_TRUE(reader) << error;
        while (const auto message = reader ? reader->next() : std::nullopt)
            messages.emplace_back(message->data.begin(), message->data.end());
        return messages;
    }
    std::string numbered(int number) const
    {
        return path(fmt::format("recorded-{:04}.pcap", number));
    }
    static std::uintmax_t sizeOf(const std::string& file)
    {
        std::error_code error;
        const auto size = std::filesystem::file_size(file, error);
        return error ? 0 : size;
    }
    static void end(Program& program)
    {
        program.send(SIGTERM);
        EXPECT_EQ(program.waitForEnd(), 0) << program.errors();
    }

    const std::string file = path("recorded.pcap");
};

} // namespace

TEST_F(RecordingProcess, OfTheTerminalsViewerHoldsWhatItShows)
{
    const auto service = startDrive();
    const auto watch = startWatch({"--record", file});
    ASSERT_TRUE(waitUntil([&] { return watch->prints("  Serving Cell Info\n"); }));
    service->kill();
    // What was on its way arrives and is shown at the last refresh.
    ASSERT_TRUE(waitUntil([&] { return watch->says(" ***** INVALIDATED "); })) << watch->errors();
    ASSERT_TRUE(waitUntil([&] { return watch->says("Could not create QXServerConnection"); }));
    end(*watch);
    const std::string tree = decoded(file);
    EXPECT_THAT(tree, HasSubstr("Serving Cell Info"));
    const std::size_t last = watch->output().rfind("Ventrik\n");
    ASSERT_NE(last, std::string::npos);
    EXPECT_TRUE(std::string_view(watch->output()).substr(last).starts_with(tree))
        << tree << "\n---\n"
        << watch->output();
}

TEST_F(RecordingProcess, CanBeReadWhileItGrowsAndIsPrivate)
{
    const auto service = startDrive();
    const auto watch = startWatch({"--record", file});
    ASSERT_TRUE(waitUntil([&] { return sizeOf(file) > 1000; })) << watch->errors();
    struct stat status {
    };
    ASSERT_EQ(stat(file.c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777, 0600U);
    for (int i = 0; i < 3; ++i) {
        const auto before = sizeOf(file);
        EXPECT_THAT(decoded(file), HasSubstr("Serving Cell Info"));
        ASSERT_TRUE(waitUntil([&] { return sizeOf(file) > before; }));
    }
}

TEST_F(RecordingProcess, SurvivesAKill)
{
    const auto service = startDrive();
    const auto watch = startWatch({"--record", file});
    ASSERT_TRUE(waitUntil([&] { return watch->says(timerStarted); }));
    ASSERT_TRUE(waitUntil([&] { return sizeOf(file) > 1000; })) << watch->errors();
    watch->kill();
    EXPECT_THAT(decoded(file), HasSubstr("Serving Cell Info"));
}

TEST_F(RecordingProcess, OverwritesNothing)
{
    writeFile("recorded.pcap", "precious");
    for (const std::string program : {"ventrik-watch", "ventrik"}) {
        const auto viewer = start(program, {"--record", file});
        EXPECT_EQ(viewer->waitForEnd(), 1);
        EXPECT_THAT(linesOf(viewer->errors()),
                    ElementsAre(program + ": " + file +
                                ": is there already, and a recording overwrites nothing"));
    }
    const auto service = start("ventrik-telephony", {"--technology", "lte", "--record", file});
    EXPECT_EQ(service->waitForEnd(), 1);
    EXPECT_EQ(readFile(file), "precious");
}

TEST_F(RecordingProcess, OnAFullDiskEndsAndTheViewerGoesOn)
{
    const auto service = startDrive();
    const auto watch = startWatch({"--record", "/dev/full"});
    EXPECT_TRUE(waitUntil([&] {
        return watch->says("ventrik-watch: the recording ends: /dev/full: No space left on device");
    })) << watch->errors();
    const std::size_t shown = watch->output().size();
    EXPECT_TRUE(waitUntil([&] { return watch->output().size() > shown; }));
    EXPECT_TRUE(watch->says("<3> the recording ends: /dev/full: No space left on device\n"));
    end(*watch);
    const auto first = watch->errors().find("ventrik-watch: the recording ends");
    EXPECT_EQ(watch->errors().find("ventrik-watch: the recording ends", first + 1),
              std::string::npos);
}

TEST_F(RecordingProcess, ThatMayNotGrowIsWholeAsFarAsItGoes)
{
    const auto service = startDrive();
    const auto watch = startInShell("ventrik-watch", {"--record", file}, "ulimit -f 16");
    EXPECT_TRUE(waitUntil([&] { return watch->says(file + ": File too large\n"); }))
        << watch->errors();
    EXPECT_TRUE(watch->isRunning());
    EXPECT_THAT(decoded(file), HasSubstr("Serving Cell Info"));
}

TEST_F(RecordingProcess, BeginsNewFilesAtASize)
{
    const std::string drive = path("drive.pcap");
    const auto writing =
        start("ventrik-telephony", {"--technology", "lte", "--write", drive, "--count", "3000"});
    EXPECT_EQ(writing->waitForEnd(), 0) << writing->errors();
    const auto service =
        startService({"--replay", drive, "--speed", "max", "--record", file, "--rotate", "64K"});
    LogChannelClient client(runtimeDirectory(), "org.ventrik.Test");
    ASSERT_TRUE(client.open());
    client.startStreaming();
    ASSERT_TRUE(waitUntil([&] { return client.messages().size() == 3000; }));
    end(*service);
    std::vector<Bytes> recorded;
    for (int number = 1; sizeOf(numbered(number)) > 0; ++number) {
        EXPECT_LE(sizeOf(numbered(number)), 65536U);
        for (const Bytes& message : messagesIn(numbered(number)))
            recorded.push_back(message);
    }
    EXPECT_GT(sizeOf(numbered(2)), 0U);
    EXPECT_EQ(recorded, client.messages());
}

TEST_F(RecordingProcess, OfAServiceHoldsWhatItsFirstChannelGets)
{
    const auto service = startService({"--technology", "lte", "--record", file});
    LogChannelClient client(runtimeDirectory(), "org.ventrik.Test");
    LogChannelClient other(runtimeDirectory(), "org.ventrik.Other");
    ASSERT_TRUE(client.open());
    client.startStreaming();
    ASSERT_TRUE(waitUntil([&] { return client.messages().size() > 20; }));
    ASSERT_TRUE(other.open());
    other.startStreaming();
    ASSERT_TRUE(waitUntil([&] { return other.messages().size() > 20; }));
    end(*service);
    waitUntil([] { return false; }, Milliseconds(100)); // what is on its way arrives

    EXPECT_EQ(messagesIn(file), client.messages());
}

} // namespace ventrik
