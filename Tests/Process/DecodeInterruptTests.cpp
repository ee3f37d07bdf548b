#include "Tests/Process/DecodeFixture.h"

#include <csignal>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;
using testing::StartsWith;

class DecodeInterrupt : public DecodeFixture
{
  protected:
    /// It handles the interrupt and sleeps, so that it waits for input.
    static bool waitsForInput(const Program& program)
    {
        const auto caught = std::strtoull(program.statusField("SigCgt").c_str(), nullptr, 16);
        const bool handlesInterrupt = (caught >> (SIGINT - 1) & 1) != 0;
        return handlesInterrupt && program.hasTakenInput() &&
               program.statusField("State").starts_with("S");
    }
    void interruptIdle(Program& program)
    {
        ASSERT_TRUE(waitUntil([&] { return waitsForInput(program); }));
        program.send(SIGINT);
        EXPECT_EQ(program.waitForEnd(), 130) << program.errors();
    }
};

} // namespace

TEST_F(DecodeInterrupt, EndsItBeforeAnyInputCame)
{
    const auto program = start("ventrik-decode", {"-"});
    interruptIdle(*program);
    EXPECT_THAT(program->output(), IsEmpty());
    EXPECT_THAT(program->errors(), IsEmpty());
}

TEST_F(DecodeInterrupt, EndsItBetweenMessagesAndKeepsWhatWasDecoded)
{
    const auto program = start("ventrik-decode", withResources({"--format", "jsonl", "-"}));
    program->write(cellCapture().bytes());
    interruptIdle(*program);
    EXPECT_THAT(linesOf(program->output()),
                ElementsAre(StartsWith(R"({"packet": 0, )"), StartsWith(R"({"packet": 1, )")));
    EXPECT_THAT(program->errors(), IsEmpty());
}

TEST_F(DecodeInterrupt, LeavesItAloneWhereItWasStartedToIgnoreThat)
{
    const auto program = startInShell("ventrik-decode", withResources({"-"}), "trap '' INT");
    program->write(cellCapture().bytes());
    ASSERT_TRUE(waitUntil([&] {
        return program->hasTakenInput() && program->statusField("Name") == "ventrik-decode" &&
               program->statusField("State").starts_with("S");
    }));
    program->send(SIGINT);
    program->closeInput();
    EXPECT_EQ(program->waitForEnd(), 0) << program->errors();
}

} // namespace ventrik
