#include "Tests/Process/ProcessFixture.h"

#include <csignal>

namespace ventrik
{

namespace
{

constexpr const char* pythonScript = R"python(
import plistlib, sys
snapshot = plistlib.load(open(sys.argv[1], "rb"))
print(list(snapshot))
print(snapshot["Description"])
data = snapshot["Data"]
print(all(entry["Description"] == "Snapshot (%s)" % entry["Date"] for entry in data[:-1]))
dlf = data[-1]["DLF"]
print(data[-1]["Description"] == "DLF binary (%d bytes)" % len(dlf))
print(dlf[:4].hex(), len(dlf) == 161 + sum(len(entry["DisplayState"]) - 1 for entry in data[:-1]))
)python";

/// The viewer with somebody who saves a snapshot as soon as values are shown.
class WindowSnapshot : public ProcessFixture
{
  protected:
    WindowSnapshot()
    {
        environment.insert("QT_PLUGIN_PATH", VENTRIK_TEST_PLUGINS);
        environment.insert("QT_QPA_GENERIC_PLUGINS", "typist");
    }
    ProgramPointer startWindow(Arguments arguments)
    {
        arguments.insert(arguments.end(), {"--save-button", "--verbose"});
        return start("ventrik", arguments);
    }
    // The name of the one snapshot in a directory, once it is whole.
    static std::string waitForSnapshot(const std::string& directory)
    {
        const auto isWhole = [&] {
            const auto names = namesIn(directory);
            return names.size() == 1 &&
                   readFile(directory + "/" + *names.begin()).ends_with("</plist>\n");
        };
        return waitUntil(isWhole) ? directory + "/" + *namesIn(directory).begin() : "none";
    }
};

} // namespace

TEST_F(WindowSnapshot, IsSavedIntoTheUsersStateAndReadByPython)
{
    const auto service = startScenario();
    const auto window = startWindow({});
    const std::string file = waitForSnapshot(path("home/state/ventrik/DiagnosticLogs"));
    Program python("/usr/bin/python3", {"-c", pythonScript, file}, environment);
    EXPECT_EQ(python.waitForEnd(), 0) << python.errors();
    EXPECT_EQ(python.output(), "['Timestamp', 'Data', 'Description']\n"
                               "On the road\n"
                               "True\n"
                               "True\n"
                               "a100fd1f True\n");
    window->send(SIGTERM);
    EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
}

TEST_F(WindowSnapshot, IsSavedWhereTheOptionSays)
{
    const auto service = startScenario();
    const auto window = startWindow({"--snapshot-directory", path("logs")});
    EXPECT_THAT(waitForSnapshot(path("logs")), testing::EndsWith(".ventrik"));
    window->send(SIGTERM);
    EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
}

TEST_F(WindowSnapshot, ThatCannotBeWrittenIsLoggedAndTheViewerGoesOn)
{
    const auto service = startScenario();
    const auto window = startWindow({"--snapshot-directory", writeFile("file", "")});
    EXPECT_TRUE(waitUntil([&] {
        return window->says("<3> Unable to write snapshot to " + path("file") +
                            "/VentrikSnapshot-");
    })) << window->errors();
    EXPECT_TRUE(window->isRunning());
    window->send(SIGTERM);
    EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
}

} // namespace ventrik
