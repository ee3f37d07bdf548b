#include "Files/PrivateFile.h"

#include <filesystem>
#include <fstream>
#include <set>

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::IsEmpty;

/// A directory of the test's own.
class PrivateFileTest : public testing::Test
{
  protected:
    PrivateFileTest()
    {
        std::string pattern = testing::TempDir() + "ventrik-files-XXXXXX";
        directory = mkdtemp(pattern.data());
        path = directory + "/file";
    }
    ~PrivateFileTest() override { fs::remove_all(directory); }

    static std::string read(const std::string& file)
    {
        std::ifstream stream(file, std::ios::binary);
        return {std::istreambuf_iterator<char>(stream), {}};
    }
    static unsigned modeOf(const std::string& file)
    {
        struct stat status {
        };
        EXPECT_EQ(lstat(file.c_str(), &status), 0) << file;
        return status.st_mode & 07777U;
    }
    std::set<std::string> names() const
    {
        std::set<std::string> result;
        for (const auto& entry : fs::directory_iterator(directory))
            result.insert(entry.path().filename());
        return result;
    }
    bool save(std::string_view text)
    {
        auto file = PrivateFile::create(path, error);
        if (!file)
            return false;
        file->write(text);
        return file->commit(error);
    }

    std::string directory;
    std::string path;
    std::string error;
};

} // namespace

TEST_F(PrivateFileTest, HoldsWhatWasWrittenAndIsItsOwnersAlone)
{
    const mode_t before = umask(0);
    EXPECT_TRUE(save("content")) << error;
    umask(before);
    EXPECT_EQ(read(path), "content");
    EXPECT_EQ(modeOf(path), 0600U);
    EXPECT_THAT(names(), ElementsAre("file"));
}

TEST_F(PrivateFileTest, IsReadByAllWhereThatIsSaidWhateverTheProcessMasks)
{
    const mode_t before = umask(077);
    auto file = PrivateFile::createForAll(path, error);
    ASSERT_TRUE(file) << error;
    file->write("content");
    EXPECT_TRUE(file->commit(error)) << error;
    umask(before);
    EXPECT_EQ(read(path), "content");
    EXPECT_EQ(modeOf(path), 0644U);
    EXPECT_THAT(names(), ElementsAre("file"));
}

TEST_F(PrivateFileTest, IsNotThereBeforeItIsWhole)
{
    auto file = PrivateFile::create(path, error);
    file->write("content");
    std::fflush(file->stream());
    EXPECT_FALSE(fs::exists(path));
    EXPECT_TRUE(file->commit(error));
    EXPECT_TRUE(fs::exists(path));
}

TEST_F(PrivateFileTest, LeavesTheOldFileAloneUntilItIsWhole)
{
    std::ofstream(path) << "old";
    {
        auto file = PrivateFile::create(path, error);
        file->write("new");
        EXPECT_EQ(read(path), "old");
    }
    EXPECT_EQ(read(path), "old");
    EXPECT_THAT(names(), ElementsAre("file"));
    EXPECT_TRUE(save("new"));
    EXPECT_EQ(read(path), "new");
}

TEST_F(PrivateFileTest, TakesThePlaceOfALinkAndLeavesItsTargetAlone)
{
    std::ofstream(directory + "/target") << "precious";
    fs::create_symlink(directory + "/target", path);
    EXPECT_TRUE(save("content")) << error;
    EXPECT_EQ(read(directory + "/target"), "precious");
    EXPECT_FALSE(fs::is_symlink(path));
    EXPECT_EQ(read(path), "content");
}

TEST_F(PrivateFileTest, TakesThePlaceOfALinkThatLeadsNowhere)
{
    fs::create_symlink(directory + "/nothing", path);
    EXPECT_TRUE(save("content")) << error;
    EXPECT_FALSE(fs::exists(directory + "/nothing"));
    EXPECT_EQ(read(path), "content");
}

TEST_F(PrivateFileTest, TakesThePlaceOfAPipeThatNobodyReads)
{
    ASSERT_EQ(mkfifo(path.c_str(), 0600), 0);
    EXPECT_TRUE(save("content")) << error;
    EXPECT_TRUE(fs::is_regular_file(path));
}

TEST_F(PrivateFileTest, RefusesADeviceAlsoBehindALink)
{
    path = "/dev/null";
    EXPECT_FALSE(save("content"));
    EXPECT_EQ(error, "/dev/null: is no ordinary file");
    path = directory + "/link";
    fs::create_symlink("/dev/null", path);
    EXPECT_FALSE(save("content"));
    EXPECT_EQ(error, path + ": is no ordinary file");
}

TEST_F(PrivateFileTest, RefusesADirectory)
{
    path = directory;
    EXPECT_FALSE(save("content"));
    EXPECT_EQ(error, directory + ": Is a directory");
    path = directory + "/";
    EXPECT_FALSE(save("content"));
}

TEST_F(PrivateFileTest, TellsThatItsDirectoryIsMissing)
{
    path = directory + "/none/file";
    EXPECT_FALSE(save("content"));
    EXPECT_EQ(error, path + ": No such file or directory");
}

TEST_F(PrivateFileTest, TellsThatItHasNoName)
{
    path = "";
    EXPECT_FALSE(save("content"));
    EXPECT_EQ(error, ": No such file or directory");
}

TEST_F(PrivateFileTest, MayStandInTheWorkingDirectory)
{
    const fs::path before = fs::current_path();
    fs::current_path(directory);
    path = "plain";
    EXPECT_TRUE(save("content")) << error;
    fs::current_path(before);
    EXPECT_EQ(read(directory + "/plain"), "content");
}

// A stream onto a full device fails as one onto a full disk does.
TEST_F(PrivateFileTest, ThatDidNotGetToTheDiskLeavesTheOldFileAndNothingElse)
{
    std::ofstream(path) << "old";
    auto file = PrivateFile::create(path, error);
    const int full = open("/dev/full", O_WRONLY);
    ASSERT_GE(full, 0);
    dup2(full, fileno(file->stream()));
    close(full);
    file->write("new");
    EXPECT_FALSE(file->commit(error));
    EXPECT_EQ(error, path + ": No space left on device");
    EXPECT_EQ(read(path), "old");
    EXPECT_THAT(names(), ElementsAre("file"));
}

TEST_F(PrivateFileTest, MovesWithItsContent)
{
    auto first = PrivateFile::create(path, error);
    first->write("content");
    PrivateFile second = std::move(*first);
    first.reset();
    EXPECT_TRUE(second.commit(error));
    EXPECT_EQ(read(path), "content");
}

TEST_F(PrivateFileTest, DirectoriesAreMadeForTheirOwnerAloneWithTheirParents)
{
    const mode_t before = umask(0);
    EXPECT_TRUE(makePrivateDirectories(directory + "/a/b/c"));
    umask(before);
    for (const char* name : {"/a", "/a/b", "/a/b/c"})
        EXPECT_EQ(modeOf(directory + name), 0700U);
}

TEST_F(PrivateFileTest, DirectoriesThatAreThereKeepTheirMode)
{
    fs::create_directory(directory + "/a");
    chmod((directory + "/a").c_str(), 0755);
    EXPECT_TRUE(makePrivateDirectories(directory + "/a/b"));
    EXPECT_TRUE(makePrivateDirectories(directory + "/a"));
    EXPECT_EQ(modeOf(directory + "/a"), 0755U);
}

TEST_F(PrivateFileTest, ADirectoryCannotStandInAFile)
{
    std::ofstream(directory + "/a") << "";
    EXPECT_FALSE(makePrivateDirectories(directory + "/a/b"));
    EXPECT_EQ(errno, ENOTDIR);
    EXPECT_FALSE(makePrivateDirectories(directory + "/a"));
    EXPECT_EQ(errno, EEXIST);
}

} // namespace ventrik
