#pragma once

#include "Tests/Process/ProcessFixture.h"

namespace ventrik
{

/// How a tool meets wrong usage, and the options that every tool has.
class ToolUsageFixture : public ProcessFixture
{
  protected:
    void expectRefused(const std::string& tool, const std::vector<Arguments>& wrongUsages)
    {
        for (const Arguments& arguments : wrongUsages) {
            const auto program = start(tool, arguments);
            EXPECT_EQ(program->waitForEnd(), 2) << testing::PrintToString(arguments);
            EXPECT_THAT(program->output(), testing::IsEmpty());
            EXPECT_THAT(linesOf(program->errors()),
                        testing::ElementsAre(testing::StartsWith(tool + ": ")))
                << testing::PrintToString(arguments);
        }
    }
    void expectHelpAndVersion(const std::string& tool, const std::string& usage)
    {
        const auto help = start(tool, {"--help"});
        EXPECT_EQ(help->waitForEnd(), 0);
        EXPECT_THAT(help->output(), testing::StartsWith("Usage: " + tool + " " + usage + "\n"));
        for (const std::string& line : linesOf(help->output()))
            EXPECT_LE(line.size(), 80U) << line;
        EXPECT_THAT(help->errors(), testing::IsEmpty());
        const auto version = start(tool, {"--version"});
        EXPECT_EQ(version->waitForEnd(), 0);
        EXPECT_EQ(version->output(), tool + " " VENTRIK_TEST_VERSION "\n");
        EXPECT_THAT(version->errors(), testing::IsEmpty());
    }
};

} // namespace ventrik
