#include "Tests/Platform/PortsFixture.h"

#include <filesystem>
#include <fstream>

#include <sys/stat.h>
#include <unistd.h>

namespace ventrik
{
namespace
{

using ::testing::HasSubstr;

class LinuxMessagePortsTest : public PortsTest
{
  protected:
    LocalPortCreation create(const std::string& name)
    {
        return ports.createLocalPort(name, PortSenders::SameUser, nullptr);
    }
    mode_t directoryMode() const
    {
        struct stat status {
        };
        stat(directory.c_str(), &status);
        return status.st_mode & 07777;
    }
    bool fileExists(const std::string& name) const
    {
        return std::filesystem::exists(directory + "/" + name);
    }
};

TEST_F(LinuxMessagePortsTest, MakesAPrivateDirectoryWithAFileForThePort)
{
    const auto creation = create("port");
    ASSERT_NE(creation.port, nullptr);
    EXPECT_FALSE(creation.alreadyExists);
    EXPECT_EQ(creation.port->name(), "port");
    EXPECT_TRUE(creation.port->isValid());
    EXPECT_EQ(directoryMode(), 0700U);
    EXPECT_TRUE(fileExists("port"));
}

TEST_F(LinuxMessagePortsTest, TightensTheDirectoryOfOurOwnRule)
{
    std::filesystem::create_directory(directory);
    chmod(directory.c_str(), 0755);
    LinuxMessagePorts own({directory, PortDirectory::Origin::Ours}, log);
    EXPECT_NE(own.createLocalPort("port", PortSenders::SameUser, nullptr).port, nullptr);
    EXPECT_EQ(directoryMode(), 0700U);
}

TEST_F(LinuxMessagePortsTest, RefusesANamedDirectoryThatOthersMayUseAndLeavesItAsItIs)
{
    std::filesystem::create_directory(directory);
    for (const mode_t mode : {0755, 0710, 0702}) {
        chmod(directory.c_str(), mode);
        const auto creation = create("port");
        EXPECT_EQ(creation.port, nullptr);
        EXPECT_THAT(creation.error,
                    HasSubstr("runtime directory " + directory + " may be used by others"));
        EXPECT_EQ(directoryMode(), mode);
    }
}

TEST_F(LinuxMessagePortsTest, MakesMissingParentsPrivateToo)
{
    const std::string parent = temporary.filePath("a").toStdString();
    LinuxMessagePorts nested(parent + "/b/run", log);
    EXPECT_NE(nested.createLocalPort("port", PortSenders::SameUser, nullptr).port, nullptr);
    for (const char* name : {"", "/b", "/b/run"}) {
        struct stat status {
        };
        ASSERT_EQ(stat((parent + name).c_str(), &status), 0);
        EXPECT_EQ(status.st_mode & 07777U, 0700U);
    }
}

TEST_F(LinuxMessagePortsTest, RefusesADirectoryThatIsAFile)
{
    std::ofstream(directory) << "x";
    const auto creation = create("port");
    EXPECT_EQ(creation.port, nullptr);
    EXPECT_THAT(creation.error, HasSubstr("runtime directory " + directory + " cannot be used"));
}

TEST_F(LinuxMessagePortsTest, RefusesADirectoryBehindALink)
{
    const std::string target = temporary.filePath("target").toStdString();
    std::filesystem::create_directory(target);
    chmod(target.c_str(), 0700);
    std::filesystem::create_directory_symlink(target, directory);
    for (const char* ending : {"", "/", "//"}) {
        LinuxMessagePorts linked(directory + ending, log);
        const auto creation = linked.createLocalPort("port", PortSenders::SameUser, nullptr);
        EXPECT_EQ(creation.port, nullptr);
        EXPECT_EQ(creation.error,
                  "runtime directory " + directory + " is a symbolic link, which is not followed");
    }
}

TEST_F(LinuxMessagePortsTest, RefusesNamesThatAreNoFileNames)
{
    EXPECT_EQ(create("a/b").error, "port name \"a/b\" cannot be a file name");
    EXPECT_EQ(create("").error, "port name \"\" cannot be a file name");
    EXPECT_EQ(create("..").error, "port name \"..\" cannot be a file name");
}

TEST_F(LinuxMessagePortsTest, RefusesNamesThatAreTooLongForASocket)
{
    const auto creation = create(std::string(108, 'n'));
    EXPECT_EQ(creation.port, nullptr);
    EXPECT_THAT(creation.error, HasSubstr("is longer than 107 bytes"));
}

TEST_F(LinuxMessagePortsTest, HandsBackTheExistingPort)
{
    const auto first = create("port");
    const auto second = create("port");
    EXPECT_TRUE(second.alreadyExists);
    EXPECT_EQ(second.port, first.port);
}

TEST_F(LinuxMessagePortsTest, FreesTheNameOnInvalidation)
{
    const auto first = create("port");
    first.port->invalidate();
    EXPECT_FALSE(fileExists("port"));
    const auto second = create("port");
    ASSERT_NE(second.port, nullptr);
    EXPECT_FALSE(second.alreadyExists);
}

TEST_F(LinuxMessagePortsTest, FreesTheNameWithTheLastReference)
{
    create("port").port.reset();
    EXPECT_FALSE(fileExists("port"));
}

TEST_F(LinuxMessagePortsTest, CountsALivePortOfAnotherProcessAsTaken)
{
    ASSERT_EQ(startHelper("port"), "ready");
    const auto creation = create("port");
    EXPECT_EQ(creation.port, nullptr);
    EXPECT_FALSE(creation.alreadyExists);
    EXPECT_TRUE(creation.nameIsTaken);
    EXPECT_EQ(creation.error, "port port is in use by another process");
}

TEST_F(LinuxMessagePortsTest, TellsAnotherProcessThatItsNameIsTaken)
{
    const auto creation = create("port");
    EXPECT_EQ(startHelper("port"), "port port is in use by another process");
}

TEST_F(LinuxMessagePortsTest, TakesOverTheFileOfAKilledProcess)
{
    ASSERT_EQ(startHelper("port"), "ready");
    killHelper();
    ASSERT_TRUE(fileExists("port"));
    EXPECT_EQ(ports.createRemotePort("port"), nullptr);
    EXPECT_NE(create("port").port, nullptr);
}

TEST_F(LinuxMessagePortsTest, LeavesAFileThatIsNoSocketAlone)
{
    ASSERT_NE(create("first").port, nullptr);
    std::ofstream(directory + "/port") << "x";
    EXPECT_THAT(create("port").error, HasSubstr("something else than a socket is there"));
    EXPECT_TRUE(fileExists("port"));
}

TEST_F(LinuxMessagePortsTest, RemovesOnlyItsOwnFile)
{
    const auto creation = create("port");
    std::filesystem::rename(directory + "/port", directory + "/moved");
    const FileDescriptor other = listenSocket(directory + "/port");
    creation.port->invalidate();
    EXPECT_TRUE(fileExists("port"));
}

TEST_F(LinuxMessagePortsTest, WaitsForAnotherProcessThatMakesAPort)
{
    ASSERT_NE(create("port").port, nullptr);
    {
        const FileDescriptor lock = PortDirectory(directory).lock();
        ASSERT_TRUE(lock.isOpen());
        EXPECT_THAT(create("second").error, HasSubstr("cannot be locked")); // after 1 s for real
    }
    EXPECT_NE(create("second").port, nullptr);
}

TEST_F(LinuxMessagePortsTest, GivesNoRemotePortWhereNobodyListens)
{
    EXPECT_EQ(ports.createRemotePort("port"), nullptr);
    const auto creation = create("port");
    EXPECT_EQ(ports.createRemotePort("other"), nullptr);
    EXPECT_NE(ports.createRemotePort("port"), nullptr);
}

TEST_F(LinuxMessagePortsTest, ConnectsOnlyToWhatTheTrustedUserServes)
{
    const auto creation = create("port");
    LinuxMessagePorts distrusting(directory, log, geteuid() + 1);
    EXPECT_EQ(distrusting.createRemotePort("port"), nullptr);
    EXPECT_TRUE(log.contains(fmt::format("port port is not used: it belongs to user {}, not to "
                                         "user {}",
                                         geteuid(), geteuid() + 1)));
}

TEST_F(LinuxMessagePortsTest, RefusesTheDirectoryOfAnotherUser)
{
    std::filesystem::create_directory(directory);
    if (chown(directory.c_str(), geteuid() + 1, getegid()) != 0) {
        directory = "/"; // belongs to somebody else whenever this user may not give files away
    }
    LinuxMessagePorts others(directory, log);
    const auto creation = others.createLocalPort("port", PortSenders::SameUser, nullptr);
    EXPECT_EQ(creation.port, nullptr);
    EXPECT_THAT(creation.error, HasSubstr("belongs to user"));
    EXPECT_EQ(others.createRemotePort("port"), nullptr);
}

TEST(PortDirectory, ComesFromTheEnvironment)
{
    qputenv("VENTRIK_RUNTIME_DIR", "/chosen");
    EXPECT_EQ(PortDirectory::fromEnvironment().path(), "/chosen");
    qunsetenv("VENTRIK_RUNTIME_DIR");
    qputenv("XDG_RUNTIME_DIR", "relative");
    EXPECT_EQ(PortDirectory::fromEnvironment().path(), "/tmp/ventrik-" + std::to_string(geteuid()));
    qputenv("XDG_RUNTIME_DIR", "/run/user/7");
    EXPECT_EQ(PortDirectory::fromEnvironment().path(), "/run/user/7/ventrik");
    qunsetenv("XDG_RUNTIME_DIR");
    EXPECT_EQ(PortDirectory::fromEnvironment().path(), "/tmp/ventrik-" + std::to_string(geteuid()));
}

} // namespace
} // namespace ventrik
