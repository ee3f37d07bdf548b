#include "Tests/Process/LogChannelClient.h"
#include "Tests/Process/ProcessFixture.h"

#include <csignal>

namespace ventrik
{

namespace
{

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using testing::StartsWith;

class ServiceProcess : public ProcessFixture
{
  protected:
    void expectCleanEnd(int signal)
    {
        const auto service = startScenario();
        LogChannelClient client(runtimeDirectory(), "org.ventrik.Test");
        ASSERT_TRUE(client.open());
        service->send(signal);
        EXPECT_EQ(service->waitForEnd(), 0) << service->errors();
        EXPECT_THAT(sockets(), ElementsAre("org.ventrik.Test")); // the client's own
        EXPECT_THAT(service->errors(), IsEmpty());
    }
};

} // namespace

TEST_F(ServiceProcess, EndsOnSIGTERMAndLeavesNoSocket)
{
    expectCleanEnd(SIGTERM);
}

TEST_F(ServiceProcess, EndsOnSIGINTAndLeavesNoSocket)
{
    expectCleanEnd(SIGINT);
}

TEST_F(ServiceProcess, OfWhichOneRunsInThisDirectoryAlreadySaysSoAndEnds)
{
    const auto first = startScenario();
    const auto second = start("ventrik-telephony", {"--technology", "lte"});
    EXPECT_EQ(second->waitForEnd(), 1);
    EXPECT_THAT(linesOf(second->errors()), ElementsAre(StartsWith("ventrik-telephony: ")));
    EXPECT_TRUE(first->isRunning());
    EXPECT_THAT(sockets(), ElementsAre("org.ventrik.TelephonyService"));
}

TEST_F(ServiceProcess, TakesOverTheSocketOfAKilledOne)
{
    startScenario()->kill();
    ASSERT_THAT(sockets(), ElementsAre("org.ventrik.TelephonyService"));
    const auto service = startScenario();
    LogChannelClient client(runtimeDirectory(), "org.ventrik.Test");
    EXPECT_TRUE(client.open());
}

TEST_F(ServiceProcess, ServesTwoLogChannelsAtOnce)
{
    const auto service = startScenario();
    LogChannelClient first(runtimeDirectory(), "org.ventrik.Test.First");
    LogChannelClient second(runtimeDirectory(), "org.ventrik.Test.Second");
    ASSERT_TRUE(first.open());
    ASSERT_TRUE(second.open());
    EXPECT_NE(first.remotePortName(), second.remotePortName());
    first.startStreaming();
    second.startStreaming();
    ASSERT_TRUE(
        waitUntil([&] { return first.messages().size() >= 10 && second.messages().size() >= 10; }));
    // Each sees the whole story from its start.
    for (std::size_t i = 0; i < 10; ++i)
        EXPECT_EQ(first.messages()[i], second.messages()[i]) << i;
}

TEST_F(ServiceProcess, ClosesTheLogChannelOfAClientThatHasGone)
{
    const auto service = startScenario();
    {
        LogChannelClient client(runtimeDirectory(), "org.ventrik.Test");
        ASSERT_TRUE(client.open());
        EXPECT_THAT(sockets(), SizeIs(3));
    }
    EXPECT_TRUE(waitUntil([&] { return sockets().size() == 1; }));
}

// A limit on the size of files stands for the full disk.
TEST_F(ServiceProcess, WhoseCaptureDoesNotFitOnTheDiskLeavesTheOldOneAndNothingElse)
{
    const std::string capture = writeFile("logs/old.pcap", "the old one");
    Program service("/bin/sh",
                    {"-c", "trap '' XFSZ; ulimit -f 8; exec \"$@\"", "sh",
                     VENTRIK_PROGRAMS "/ventrik-telephony", "--technology", "lte", "--write",
                     capture},
                    environment);
    EXPECT_EQ(service.waitForEnd(), 1);
    EXPECT_EQ(service.errors(), "ventrik-telephony: " + capture + ": File too large\n");
    EXPECT_EQ(readFile(capture), "the old one");
    EXPECT_THAT(namesIn(path("logs")), ElementsAre("old.pcap"));
}

TEST_F(ServiceProcess, RefusesAClientThatNamesItsOwnPort)
{
    const auto service = startScenario();
    CapturingSystemLog log;
    LinuxMainQueue queue;
    LinuxMessagePorts ports(runtimeDirectory(), log);
    LinuxTelephonyClient telephony(ports, queue);
    const auto connection = telephony.createServerConnection({});
    ASSERT_TRUE(connection);
    const auto answer = connection->networkMonitorCreateLogChannel("org.ventrik.TelephonyService");
    EXPECT_EQ(answer.error.code, EINVAL);
}

} // namespace ventrik
