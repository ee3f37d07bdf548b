#include "Tools/CommandLine.h"
#include "Tools/OptionValues.h"

#include <vector>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::ExitedWithCode;

// A program with one of each.
class CommandLineTest : public testing::Test
{
  protected:
    void parse(std::vector<std::string> arguments)
    {
        CommandLine line("tool", "Does what a tool does.");
        line.addArgument("FILE", "what it reads", file);
        line.addOption("--count N", "so many of them", count, wholeNumberValue);
        line.addOption("--name TEXT", "its name", name, textValue);
        line.addFlag("--once", "ends after the first", once);
        std::vector<char*> argv{program.data()};
        for (std::string& argument : arguments)
            argv.push_back(argument.data());
        line.parse(static_cast<int>(argv.size()), argv.data());
    }
    void expectRefused(const std::vector<std::string>& arguments, const std::string& reason)
    {
        EXPECT_EXIT(parse(arguments), ExitedWithCode(2), "^tool: " + reason + "; see --help\n$");
    }

    std::string program = "/usr/bin/tool";
    std::string file;
    std::string name = "none";
    std::uint32_t count = 1;
    bool once = false;
};

} // namespace

TEST_F(CommandLineTest, KeepsTheDefaultsOfWhatIsNotGiven)
{
    parse({"file"});
    EXPECT_EQ(file, "file");
    EXPECT_EQ(count, 1U);
    EXPECT_EQ(name, "none");
    EXPECT_FALSE(once);
}

TEST_F(CommandLineTest, TakesAValueBehindAnEqualsSignOrInTheNextArgument)
{
    parse({"--count=2", "file", "--name", "a=b", "--once"});
    EXPECT_EQ(count, 2U);
    EXPECT_EQ(name, "a=b");
    EXPECT_TRUE(once);
}

TEST_F(CommandLineTest, TakesAnEmptyValue)
{
    parse({"--name=", "file"});
    EXPECT_EQ(name, "");
    EXPECT_EQ(file, "file");
}

TEST_F(CommandLineTest, TakesAValueThatLooksLikeAnOption)
{
    for (const std::string value : {"--once", "--count=3", "--", "-", "[a,b]"}) {
        parse({"--name", value, "file"});
        EXPECT_EQ(name, value);
        EXPECT_FALSE(once);
        EXPECT_EQ(count, 1U);
    }
}

TEST_F(CommandLineTest, TakesTheLastOfAnOptionThatIsRepeated)
{
    parse({"--count", "2", "--once", "file", "--count=3", "--once"});
    EXPECT_EQ(count, 3U);
}

TEST_F(CommandLineTest, RefusesABadValueBeforeAGoodOne)
{
    expectRefused({"--count=x", "--count=3", "file"},
                  R"(--count: 'x' is no whole number below 2\^32)");
}

TEST_F(CommandLineTest, TakesASingleDashAndAllBehindTwoAsArguments)
{
    parse({"-"});
    EXPECT_EQ(file, "-");
    for (const std::string argument : {"--once", "--name=x", "--", "[a,b]"}) {
        parse({"--", argument});
        EXPECT_EQ(file, argument);
        EXPECT_FALSE(once);
        EXPECT_EQ(name, "none");
    }
}

TEST_F(CommandLineTest, NamesAnOptionThatThereIsNot)
{
    expectRefused({"file", "--coun", "3"}, "there is no option '--coun'");
    expectRefused({"file", "-once"}, "there is no option '-once'");
    expectRefused({"file", "--unheard-of=1"}, "there is no option '--unheard-of=1'");
}

TEST_F(CommandLineTest, NamesAnArgumentThatNobodyTakes)
{
    expectRefused({"file", "more"}, R"(what is 'more'\?)");
    expectRefused({"file", "--", "--once"}, R"(what is '--once'\?)");
}

TEST_F(CommandLineTest, RefusesAnArgumentThatIsMissing)
{
    expectRefused({}, "FILE is required");
}

TEST_F(CommandLineTest, LeavesAProgramWithoutItsNameToItsDefaults)
{
    CommandLine line("tool", "Does what a tool does.");
    line.addFlag("--once", "ends after the first", once);
    char* none = nullptr;
    line.parse(0, &none);
    EXPECT_FALSE(once);
}

TEST_F(CommandLineTest, RefusesAnOptionWithoutItsValueAndAFlagWithOne)
{
    expectRefused({"file", "--count"}, "--count needs a value");
    expectRefused({"file", "--once=1"}, "--once takes no value");
    expectRefused({"file", "--once="}, "--once takes no value");
}

} // namespace ventrik
