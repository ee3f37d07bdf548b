#include "Tests/Support/TemporaryFile.h"
#include "Tools/FileSystemLog.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

namespace ventrik
{

TEST(FileSystemLog, WritesPriorityTabAndEscapedText)
{
    const TemporaryFile logFile("system.log");
    const std::string& path = logFile.path();
    std::string error;
    const auto log = FileSystemLog::create(path, error);
    ASSERT_TRUE(log) << error;
    log->error("Failed to get Cell Array\n");
    log->warning("a\tb\\c");
    log->log(16, "DLF");
    EXPECT_FALSE(std::filesystem::exists(path));
    EXPECT_TRUE(log->commit(error)) << error;
    std::ifstream file(path);
    EXPECT_EQ(std::string(std::istreambuf_iterator<char>(file), {}),
              "3\tFailed to get Cell Array\\n\n4\ta\\tb\\\\c\n16\tDLF\n");
}

TEST(FileSystemLog, TellsWhyAFileCannotBeMade)
{
    std::string error;
    EXPECT_FALSE(FileSystemLog::create("/nowhere/log", error));
    EXPECT_EQ(error, "/nowhere/log: No such file or directory");
}

} // namespace ventrik
