#include "Tests/Capture/SerialFrames.h"
#include "Tests/Process/EmulatedPhone.h"
#include "Tests/Process/LTECaptures.h"
#include "Tests/Process/ProcessFixture.h"

#include <csignal>
#include <filesystem>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::HasSubstr;

// What the last of a snapshot's displays shows.
constexpr const char* lastDisplay = R"python(
import plistlib, sys
entries = [entry for entry in plistlib.load(open(sys.argv[1], "rb"))["Data"] if "Display" in entry]
print(entries[-1]["Display"])
)python";

/// A window that brings its service along.
class WindowService : public ProcessFixture
{
  protected:
    WindowService()
    {
        std::filesystem::create_directories(temporary);
        environment.insert("TMPDIR", QString::fromStdString(temporary));
        environment.insert("QT_PLUGIN_PATH", VENTRIK_TEST_PLUGINS);
    }
    ProgramPointer startReadWindow(const Arguments& arguments)
    {
        environment.insert("QT_QPA_GENERIC_PLUGINS", "typist:reads");
        return start("ventrik", arguments);
    }
    std::string displayIn(const std::string& snapshot)
    {
        Program python("/usr/bin/python3", {"-c", lastDisplay, snapshot}, environment);
        EXPECT_EQ(python.waitForEnd(), 0) << python.errors();
        return python.output();
    }

    const std::string temporary = path("temporary");
};

} // namespace

TEST_F(WindowService, ShowsAPhoneAtASerialPortAndDisablesItsLogsAtTheEnd)
{
    EmulatedPhone phone(path("phone"));
    const auto window = startReadWindow({"--serial", path("phone"), "--technology", "lte"});
    ASSERT_TRUE(waitUntil([&] { return !phone.commands().empty(); })) << window->errors();
    EXPECT_TRUE(phone.send(logFrame(logRecord(0xB0C1, stampIn2025(), Bytes(9, 1)))));
    EXPECT_TRUE(waitUntil([&] { return window->says(" Ventrik – LTE | Updated "); }))
        << window->errors();
    window->send(SIGTERM);
    EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
    EXPECT_EQ(phone.commands().back(), (Bytes{0x73, 0, 0, 0, 0, 0, 0, 0}));
}

TEST_F(WindowService, TellsWhatItsPhoneRefuses)
{
    EmulatedPhone phone(path("phone"));
    const auto window = start("ventrik", {"--serial", path("phone"), "--technology", "lte"});
    ASSERT_TRUE(waitUntil([&] { return !phone.commands().empty(); })) << window->errors();
    EXPECT_TRUE(phone.send(frame(Bytes{0x13, 0x73})));
    EXPECT_TRUE(waitUntil([&] {
        return window->says("/phone refuses to send logs: it answers 0x13\n");
    })) << window->errors();
}

TEST_F(WindowService, ShowsAReplayAsDecodingDoes)
{
    const std::string capture = path("drive.pcap");
    const auto writing =
        start("ventrik-telephony", {"--technology", "lte", "--write", capture, "--count", "500"});
    EXPECT_EQ(writing->waitForEnd(), 0) << writing->errors();
    const auto decode = start("ventrik-decode", {"--snapshot", path("decoded"), capture});
    EXPECT_EQ(decode->waitForEnd(), 0) << decode->errors();
    environment.insert("QT_QPA_GENERIC_PLUGINS", "typist");
    const auto window = start("ventrik", {"--replay", capture, "--speed", "max", "--save-button",
                                          "--snapshot-directory", path("logs")});
    ASSERT_TRUE(waitUntil([&] {
        const auto names = namesIn(path("logs"));
        return names.size() == 1 &&
               readFile(path("logs/") + *names.begin()).ends_with("</plist>\n");
    })) << window->errors();
    EXPECT_THAT(displayIn(path("decoded")), HasSubstr("Serving Cell Info"));
    EXPECT_EQ(displayIn(path("logs/") + *namesIn(path("logs")).begin()),
              displayIn(path("decoded")));
}

TEST_F(WindowService, ReplaysWithTheTechnologyThatIsNamed)
{
    const Bytes untold = PcapBytes(1).record(captureStart, 0, cellInfoMessage(7)).bytes();
    const auto window =
        startReadWindow({"--replay", writeFile("untold.pcap", untold), "--technology", "lte"});
    EXPECT_TRUE(waitUntil([&] { return window->says(" Ventrik – LTE | Updated "); }))
        << window->errors();
}

TEST_F(WindowService, SaysWhyACaptureCannotBeReplayed)
{
    const auto window = start("ventrik", {"--replay", path("missing.pcap")});
    EXPECT_EQ(window->waitForEnd(), 1);
    EXPECT_THAT(linesOf(window->errors()),
                ElementsAre("ventrik: the replay service ended: ventrik-telephony: " +
                            path("missing.pcap") + ": No such file or directory"));
}

TEST_F(WindowService, IsRecorded)
{
    const std::string capture = writeFile(
        "cell.pcap", PcapBytes(lteLinkType).record(captureStart, 0, cellInfoMessage(7)).bytes());
    const auto window = startReadWindow({"--replay", capture, "--record", path("recorded.pcap")});
    ASSERT_TRUE(waitUntil([&] { return window->says(" Ventrik – LTE | Updated "); }))
        << window->errors();
    window->send(SIGTERM);
    EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
    const auto decode = start("ventrik-decode", {path("recorded.pcap")});
    EXPECT_EQ(decode->waitForEnd(), 0) << decode->errors();
    EXPECT_TRUE(decode->prints("Physical Cell ID: 7\n")) << decode->output();
}

} // namespace ventrik
