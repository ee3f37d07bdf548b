#include "Tools/CaptureList.h"

#include <fstream>

#include <gmock/gmock.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;

class CaptureListTest : public testing::Test
{
  protected:
    CaptureListTest() { std::filesystem::create_directories(root); }
    ~CaptureListTest() override { std::filesystem::remove_all(root); }

    std::string path(const std::string& name) const { return (root / name).native(); }
    std::string write(const std::string& name, const std::string& content = {}) const
    {
        std::filesystem::create_directories((root / name).parent_path());
        std::ofstream(root / name) << content;
        return path(name);
    }
    static std::vector<std::string> all(CaptureList& list)
    {
        std::vector<std::string> names;
        while (const auto name = list.next())
            names.push_back(*name);
        return names;
    }

    const std::filesystem::path root =
        std::filesystem::path(testing::TempDir()) / ("captures-" + std::to_string(getpid()));
};

} // namespace

TEST_F(CaptureListTest, HasFilesAsTheyWereNamed)
{
    CaptureList list({"b", "-", "a"}, {});
    EXPECT_THAT(all(list), ElementsAre("b", "-", "a"));
}

TEST_F(CaptureListTest, HasTheFilesBelowADirectoryInOrder)
{
    const std::vector<std::string> names{write("d/b/2"), write("d/b/1"), write("d/a"),
                                         write("d/c")};
    CaptureList list({path("d"), "x"}, {});
    EXPECT_THAT(all(list), ElementsAre(names[2], names[1], names[0], names[3], "x"));
}

TEST_F(CaptureListTest, LeavesHiddenFilesOut)
{
    write("d/.hidden");
    write("d/.git/x");
    const std::string seen = write("d/seen");
    CaptureList list({path("d")}, {});
    EXPECT_THAT(all(list), ElementsAre(seen));
}

TEST_F(CaptureListTest, DoesNotGoInCircles)
{
    const std::string file = write("d/file");
    std::filesystem::create_directory_symlink(path("d"), path("d/again"));
    CaptureList list({path("d")}, {});
    EXPECT_THAT(all(list), ElementsAre(file));
}

TEST_F(CaptureListTest, HasTheNamesOfAListBehindThose)
{
    const std::string names = write("names", "first\n\nsecond with blanks\nlast without an end");
    CaptureList list({"a"}, {names});
    EXPECT_THAT(all(list), ElementsAre("a", "first", "second with blanks", "last without an end"));
}

TEST_F(CaptureListTest, TellsWhatItCannotRead)
{
    CaptureList list({}, {path("missing"), write("names", "a\n")});
    EXPECT_THAT(all(list), ElementsAre("a"));
    EXPECT_THAT(list.takeErrors(), ElementsAre(path("missing") + ": No such file or directory"));
    EXPECT_THAT(list.takeErrors(), IsEmpty());
}

TEST_F(CaptureListTest, TellsWhichDirectoryHasNoFileBelow)
{
    std::filesystem::create_directories(path("empty/below"));
    write("full/empty/.hidden");
    write("full/file");
    CaptureList list({path("empty"), path("full"), path("empty")}, {});
    EXPECT_THAT(all(list), ElementsAre(path("full/file")));
    const std::string line = path("empty") + ": there are no captures in it";
    EXPECT_THAT(list.takeErrors(), ElementsAre(line, line));
}

TEST_F(CaptureListTest, KnowsWhetherItIsOneFile)
{
    write("d/file");
    EXPECT_TRUE(CaptureList({"a"}, {}).isSingle());
    EXPECT_TRUE(CaptureList({"-"}, {}).isSingle());
    EXPECT_FALSE(CaptureList({"a", "b"}, {}).isSingle());
    EXPECT_FALSE(CaptureList({path("d")}, {}).isSingle());
    EXPECT_FALSE(CaptureList({"a"}, {"names"}).isSingle());
}

} // namespace ventrik
