#include "Platform/Linux/DiagnosticLogs.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Tests/Platform/PortsFixture.h"

#include <filesystem>
#include <fstream>
#include <iterator>

#include <sys/stat.h>

namespace ventrik
{
namespace
{

using ::testing::ElementsAre;
using ::testing::HasSubstr;

std::string contentsOf(const std::string& path)
{
    std::ifstream file(path);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

std::string configurationFile(const std::string& domain)
{
    return qgetenv("XDG_CONFIG_HOME").toStdString() + "/" + domain + ".conf";
}

TEST(LinuxSystemLog, ShowsAnEntryAsOneLine)
{
    EXPECT_EQ(LinuxSystemLog::line("ventrik", 42, 3, "one\ntwo\n\n"), "ventrik[42]: <3> one\\ntwo");
    EXPECT_EQ(LinuxSystemLog::line("ventrik", 42, 5, "\n"), "ventrik[42]: <5> ");
}

TEST(LinuxSystemLog, ShowsNothingThatATerminalWouldObey)
{
    EXPECT_EQ(LinuxSystemLog::line("ventrik", 42, 3, "a\x1b[2J\xc2\x9b\xff"),
              "ventrik[42]: <3> a [2J \xef\xbf\xbd");
}

TEST(LinuxSystemLog, CopiesEveryLineToStandardErrorWhateverItsThreshold)
{
    LinuxSystemLog log("ventrik-test", LinuxSystemLog::Copy::Everything, LogPriority::emergency);
    ::testing::internal::CaptureStderr();
    log.warning("shown {}", 1);
    log.log(LogPriority::debug, "shown too");
    EXPECT_TRUE(log.flush());
    EXPECT_EQ(::testing::internal::GetCapturedStderr(),
              fmt::format("ventrik-test[{0}]: <4> shown 1\nventrik-test[{0}]: <7> shown too\n",
                          getpid()));
}

TEST(LinuxSystemLog, CopiesItsErrorsAloneWhereThatIsAskedFor)
{
    LinuxSystemLog log("ventrik-test", LinuxSystemLog::Copy::Errors, LogPriority::emergency);
    EXPECT_FALSE(log.isEnabled(LogPriority::warning));
    ::testing::internal::CaptureStderr();
    log.warning("not shown");
    log.error("shown");
    EXPECT_TRUE(log.flush());
    EXPECT_EQ(::testing::internal::GetCapturedStderr(),
              fmt::format("ventrik-test[{}]: <3> shown\n", getpid()));
}

TEST(LinuxSystemLog, WithoutACopyFormatsNothingBelowItsThreshold)
{
    const LinuxSystemLog log("ventrik-test");
    EXPECT_TRUE(log.isEnabled(LogPriority::error));
    EXPECT_FALSE(log.isEnabled(LogPriority::warning));
}

TEST(LinuxSystemLog, ShowsTheConsolesLinesOnStandardErrorAlsoWithoutACopy)
{
    LinuxSystemLog log("ventrik-test");
    ::testing::internal::CaptureStderr();
    log.showOnConsole("hello\n");
    EXPECT_TRUE(log.flush());
    EXPECT_EQ(::testing::internal::GetCapturedStderr(), "hello\n");
}

class LinuxPreferencesTest : public ::testing::Test
{
  protected:
    CapturingSystemLog log;
    LinuxPreferences preferences{log};
};

TEST_F(LinuxPreferencesTest, WritesTheDomainsFile)
{
    preferences.set("org.ventrik.HomeScreen", "FieldTest", true);
    EXPECT_TRUE(preferences.synchronize("org.ventrik.HomeScreen"));
    EXPECT_EQ(contentsOf(configurationFile("org.ventrik.HomeScreen")),
              "[General]\nFieldTest=true\n");
}

TEST_F(LinuxPreferencesTest, KeepTexts)
{
    EXPECT_EQ(preferences.text("org.ventrik.Texts", "Records"), std::nullopt);
    preferences.setText("org.ventrik.Texts", "Records", "extended");
    EXPECT_TRUE(preferences.synchronize("org.ventrik.Texts"));
    EXPECT_EQ(LinuxPreferences(log).text("org.ventrik.Texts", "Records"), "extended");
}

TEST_F(LinuxPreferencesTest, MakeTheirMissingDirectoriesPrivate)
{
    const QTemporaryDir home;
    const std::string configuration = home.filePath("a/config").toStdString();
    const QByteArray usual = qgetenv("XDG_CONFIG_HOME");
    qputenv("XDG_CONFIG_HOME", QByteArray::fromStdString(configuration));
    preferences.set("org.ventrik.Private", "FieldTest", true);
    EXPECT_TRUE(preferences.synchronize("org.ventrik.Private"));
    qputenv("XDG_CONFIG_HOME", usual);
    EXPECT_EQ(std::filesystem::status(configuration).permissions(),
              std::filesystem::perms::owner_all);
}

TEST_F(LinuxPreferencesTest, LogsWhichFileCannotBeWrittenAndWhy)
{
    const std::string notADirectory = configurationFile("org.ventrik.HomeScreen");
    std::ofstream(notADirectory) << "[General]\n";
    const QByteArray usual = qgetenv("XDG_CONFIG_HOME");
    qputenv("XDG_CONFIG_HOME", QByteArray::fromStdString(notADirectory));
    preferences.set("org.ventrik.Lost", "FieldTest", true);
    EXPECT_FALSE(preferences.synchronize("org.ventrik.Lost"));
    qputenv("XDG_CONFIG_HOME", usual);
    EXPECT_THAT(log.texts(LogPriority::error),
                ElementsAre("The preference was not written: " + notADirectory +
                            "/org.ventrik.Lost.conf: Not a directory"));
}

TEST_F(LinuxPreferencesTest, LeaveAloneWhatHasTheirNameAndIsNoFile)
{
    const std::string pipe = configurationFile("org.ventrik.Pipe");
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
    preferences.set("org.ventrik.Pipe", "FieldTest", true);
    EXPECT_FALSE(preferences.synchronize("org.ventrik.Pipe"));
    EXPECT_TRUE(std::filesystem::is_fifo(pipe));
    EXPECT_THAT(log.texts(LogPriority::error),
                ElementsAre("The preference was not written: " + pipe + ": it is no file"));
}

TEST_F(LinuxPreferencesTest, PassOverADirectoryThatIsNotAbsolute)
{
    const QTemporaryDir home;
    const QByteArray usual = qgetenv("XDG_CONFIG_HOME");
    qputenv("HOME", home.path().toUtf8());
    qputenv("XDG_CONFIG_HOME", "relative");
    preferences.set("org.ventrik.HomeScreen", "FieldTest", true);
    EXPECT_TRUE(preferences.synchronize("org.ventrik.HomeScreen"));
    qputenv("XDG_CONFIG_HOME", usual);
    EXPECT_TRUE(std::filesystem::exists(home.path().toStdString() +
                                        "/.config/org.ventrik.HomeScreen.conf"));
}

TEST_F(LinuxPreferencesTest, PostNothingWithoutABus)
{
    EXPECT_LT(secondsOf([&] { preferences.postChanged("org.ventrik.HomeScreen", "FieldTest"); }),
              1.0);
}

TEST(DiagnosticLogs, LieWithTheUsersState)
{
    qputenv("HOME", "/home/someone");
    qputenv("XDG_STATE_HOME", "/state");
    EXPECT_EQ(defaultDiagnosticLogDirectory(), "/state/ventrik/DiagnosticLogs");
    for (const char* unusable : {"", "relative"}) {
        qputenv("XDG_STATE_HOME", unusable);
        EXPECT_EQ(defaultDiagnosticLogDirectory(),
                  "/home/someone/.local/state/ventrik/DiagnosticLogs");
    }
    qunsetenv("XDG_STATE_HOME");
}

class LinuxResourcesTest : public ::testing::Test
{
  protected:
    std::string add(const std::string& name, const std::string& contents)
    {
        const std::string path = root + "/" + name;
        std::filesystem::create_directories(std::filesystem::path(path).parent_path());
        std::ofstream(path) << contents;
        return path;
    }

    QTemporaryDir temporary;
    std::string root = temporary.path().toStdString();
    LinuxResources resources{{root + "/first", root + "/second", root + "/missing"}, "1.2"};
};

TEST_F(LinuxResourcesTest, PrefersTheEarlierDirectory)
{
    add("second/A.plist", "2");
    const auto first = add("first/A.plist", "1");
    EXPECT_EQ(resources.path("A", "plist"), first);
    EXPECT_THAT(resources.paths("plist"), ElementsAre(first));
}

TEST_F(LinuxResourcesTest, ListsATypeSorted)
{
    const auto b = add("first/B.plist", "");
    const auto a = add("first/A.plist", "");
    const auto c = add("second/C.plist", "");
    add("first/D.txt", "");
    EXPECT_THAT(resources.paths("plist"), ElementsAre(a, b, c));
}

TEST_F(LinuxResourcesTest, ReadsContents)
{
    const auto path = add("first/A.bin", std::string("\0\xFF", 2));
    EXPECT_EQ(resources.contents(path), (Bytes{0, 0xFF}));
    EXPECT_EQ(resources.contents(root + "/none"), std::nullopt);
    EXPECT_EQ(resources.contents(root), std::nullopt);
    EXPECT_EQ(resources.path("none", "plist"), std::nullopt);
    EXPECT_EQ(resources.applicationVersion(), "1.2");
}

TEST(LinuxResources, LooksFirstWhereTheEnvironmentSays)
{
    qputenv("VENTRIK_RESOURCE_DIRECTORY", "/chosen");
    EXPECT_EQ(LinuxResources::defaultDirectories().front(), "/chosen");
    qunsetenv("VENTRIK_RESOURCE_DIRECTORY");
    EXPECT_THAT(LinuxResources::defaultDirectories().front(), HasSubstr("/share/ventrik"));
}

TEST(LinuxResources, FindsTheTemplatesOfTheSourceTreeFromTheBuildTree)
{
    qunsetenv("VENTRIK_RESOURCE_DIRECTORY");
    const LinuxResources resources(LinuxResources::defaultDirectories(), std::nullopt);
    EXPECT_THAT(resources.paths("plist"),
                ElementsAre(HasSubstr("C2KTemplate"), HasSubstr("LTE.plist"), HasSubstr("LTEMore"),
                            HasSubstr("Orbel_GSM"), HasSubstr("UTRAN")));
}

TEST(LinuxClock, KnowsTheZoneInForce)
{
    qputenv("TZ", "CET-1CEST,M3.5.0,M10.5.0/3");
    const LinuxClock clock;
    using namespace std::chrono;
    const auto winter = clock.timeZone(sys_days{year{2026} / 1 / 15});
    const auto summer = clock.timeZone(sys_days{year{2026} / 7 / 15});
    qunsetenv("TZ");
    EXPECT_EQ(winter.secondsFromUtc, 3600);
    EXPECT_FALSE(winter.isDaylightSaving);
    EXPECT_EQ(summer.secondsFromUtc, 7200);
    EXPECT_TRUE(summer.isDaylightSaving);
}

TEST(LinuxPlatform, BundlesItsParts)
{
    const QTemporaryDir temporary;
    LinuxPlatformOptions options;
    options.runtimeDirectory = temporary.path().toStdString();
    options.resourceDirectories = {"/nowhere"};
    options.version = "3.4";
    LinuxPlatform owner(options);
    const Platform platform = owner.platform();
    EXPECT_EQ(platform.resources.applicationVersion(), "3.4");
    EXPECT_EQ(platform.telephony.createServerConnection({}), nullptr);
    EXPECT_NE(platform.ports.createLocalPort("port", PortSenders::SameUser, nullptr).port, nullptr);
}

} // namespace
} // namespace ventrik
