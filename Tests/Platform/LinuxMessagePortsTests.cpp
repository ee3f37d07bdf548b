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

TEST_F(LinuxMessagePortsTest, TightensItsOwnDirectory)
{
    std::filesystem::create_directory(directory);
    chmod(directory.c_str(), 0755);
    EXPECT_NE(create("port").port, nullptr);
    EXPECT_EQ(directoryMode(), 0700U);
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
    std::filesystem::create_directory_symlink(temporary.path().toStdString(), directory);
    EXPECT_EQ(create("port").port, nullptr);
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
    std::filesystem::create_directory(directory);
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
    EXPECT_EQ(PortDirectory::defaultPath(), "/chosen");
    qunsetenv("VENTRIK_RUNTIME_DIR");
    qputenv("XDG_RUNTIME_DIR", "/run/user/7");
    EXPECT_EQ(PortDirectory::defaultPath(), "/run/user/7/ventrik");
    qunsetenv("XDG_RUNTIME_DIR");
    EXPECT_EQ(PortDirectory::defaultPath(), "/tmp/ventrik-" + std::to_string(geteuid()));
}

} // namespace
} // namespace ventrik
