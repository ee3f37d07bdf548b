#include "Platform/TelephonyProtocol.h"
#include "Tests/Model/ModelFixture.h"

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using namespace TelephonyProtocol;

/// A model and how often it told that its channel's state has changed.
class ChannelState : public ModelFixture
{
  protected:
    ChannelState()
    {
        model.setChannelCallback([this] { ++changes; });
    }
    void start()
    {
        model.startMonitor();
        fake.mainQueue.run();
    }
    void expectFault(ChannelFault fault)
    {
        start();
        EXPECT_EQ(model.channelFault(), fault);
        EXPECT_FALSE(model.isConnected());
        EXPECT_FALSE(model.connectedSince());
        EXPECT_EQ(changes, 1);
    }

    int changes = 0;
};

} // namespace

TEST_F(ChannelState, IsFaultlessOnceTheChannelIsOpen)
{
    start();
    EXPECT_TRUE(model.isConnected());
    EXPECT_EQ(model.channelFault(), ChannelFault::None);
    EXPECT_EQ(model.connectedSince(), fake.clock.now());
    EXPECT_EQ(changes, 1);
}

TEST_F(ChannelState, TellsThatOurPortCannotBeMade)
{
    fake.ports.failNextLocalPort();
    expectFault(ChannelFault::NoPort);
}

TEST_F(ChannelState, TellsThatAnotherProcessHasOurPort)
{
    fake.ports.reportNextLocalPortAsTaken();
    expectFault(ChannelFault::PortTaken);
}

TEST_F(ChannelState, TellsThatOurPortExistsAlready)
{
    fake.ports.reportNextLocalPortAsExisting();
    expectFault(ChannelFault::PortTaken);
}

TEST_F(ChannelState, TellsThatThereIsNoService)
{
    fake.telephony.setServiceAvailable(false);
    expectFault(ChannelFault::NoService);
}

TEST_F(ChannelState, TellsThatTheRequestWasNotAnswered)
{
    fake.telephony.queueError({clientErrorDomain, ClientError::receiveTimeout});
    expectFault(ChannelFault::NoAnswer);
}

TEST_F(ChannelState, TellsThatTheAnswerIsNotUnderstood)
{
    fake.telephony.queueError({clientErrorDomain, ClientError::answerNotUnderstood});
    expectFault(ChannelFault::BadAnswer);
}

TEST_F(ChannelState, TellsThatTheServiceRefuses)
{
    fake.telephony.queueError({2, 13});
    expectFault(ChannelFault::Refused);
}

TEST_F(ChannelState, TellsThatNoPortWasNamed)
{
    fake.telephony.queueResult({{}, std::nullopt});
    expectFault(ChannelFault::BadAnswer);
}

TEST_F(ChannelState, TellsThatNobodyListensAtTheNamedPort)
{
    fake.ports.stopListening(remoteName);
    expectFault(ChannelFault::NoAnswer);
}

TEST_F(ChannelState, TellsThatTheTechnologyWasNotTold)
{
    fake.ports.queueError(PortError::receiveTimeout);
    expectFault(ChannelFault::NoAnswer);
}

TEST_F(ChannelState, TellsThatTheTechnologyWasAskedForAndNotAnswered)
{
    fake.ports.queueResult({PortError::success, std::nullopt});
    expectFault(ChannelFault::NoAnswer);
}

TEST_F(ChannelState, TellsThatTheServiceWentBeforeItToldTheTechnology)
{
    fake.ports.queueError(PortError::invalidPort);
    expectFault(ChannelFault::NoService);
}

TEST_F(ChannelState, TellsThatTheTechnologyIsNotUnderstood)
{
    fake.ports.queueReply({'g', 'a', 'r', 'b'});
    expectFault(ChannelFault::BadAnswer);
}

TEST_F(ChannelState, TellsThatTheTechnologyIsUnknown)
{
    answerTechnology("Semaphore");
    expectFault(ChannelFault::NoTechnology);
}

TEST_F(ChannelState, TellsThatTheStartCommandWasNotTaken)
{
    fake.ports.queueReply(
        xml(PlistDictionary{{"GetTechnology", kQXLogChannelTechnology_Orbel_LTE}}));
    fake.ports.queueError(PortError::sendTimeout);
    expectFault(ChannelFault::NoAnswer);
}

TEST_F(ChannelState, IsToldOnceForTheSameFault)
{
    fake.telephony.setServiceAvailable(false);
    start();
    fake.mainQueue.advance(20s);
    EXPECT_EQ(changes, 1);
}

TEST_F(ChannelState, IsNotToldWhereARestartOpensTheChannelAgainAtOnce)
{
    start();
    model.restartMonitor();
    fake.mainQueue.run();
    EXPECT_TRUE(model.isConnected());
    EXPECT_EQ(changes, 1);
}

TEST_F(ChannelState, IsToldWhenTheServiceDiesAlsoWithoutNews)
{
    start();
    fake.telephony.setServiceAvailable(false);
    fake.ports.killRemote(remoteName);
    fake.mainQueue.advance(2s);
    EXPECT_EQ(model.channelFault(), ChannelFault::NoService);
    EXPECT_FALSE(model.connectedSince());
    EXPECT_EQ(changes, 2);
    EXPECT_EQ(redraws, 0);
}

TEST_F(ChannelState, ExpectsTheStreamOfTheProcessThatTakesTheCommands)
{
    start();
    EXPECT_EQ(fake.ports.localPort(logChannelLocalPortName)->streamProcess(),
              FakeRemotePort::processNumber);
}

TEST_F(ChannelState, IsLostWithItsStreamAtTheNextTickAndOpenedAgain)
{
    start();
    fake.ports.localPort(logChannelLocalPortName)->loseStream();
    fake.mainQueue.advance(1999ms);
    EXPECT_EQ(fake.log.count("Starting the display update timer"), 1U);
    fake.mainQueue.advance(1ms);
    EXPECT_EQ(fake.log.count("Starting the display update timer"), 2U);
    EXPECT_TRUE(model.isConnected());
    EXPECT_FALSE(fake.ports.localPort(logChannelLocalPortName)->hasLostStream());
}

TEST_F(ChannelState, CountsFromTheNewChannelAfterALoss)
{
    start();
    const auto first = fake.clock.now();
    fake.clock.set(first + 10s);
    model.restartMonitor();
    EXPECT_EQ(model.connectedSince(), first + 10s);
}

TEST_F(ChannelState, KnowsWhenTheLastMessageCame)
{
    EXPECT_FALSE(model.lastMessageTime());
    start();
    EXPECT_FALSE(model.lastMessageTime());
    fake.clock.set(fake.clock.now() + 3s);
    arrive(cellInfo(301));
    EXPECT_EQ(model.lastMessageTime(), fake.clock.now());
}

TEST_F(ChannelState, KnowsTheTechnologyOnceItIsAnswered)
{
    EXPECT_EQ(model.technologyName(), "");
    start();
    EXPECT_EQ(model.technologyName(), "LTE");
}

TEST(ChannelFaultText, NamesEachFaultInAFewWords)
{
    EXPECT_EQ(channelFaultText(ChannelFault::None), "");
    EXPECT_EQ(channelFaultText(ChannelFault::NoPort), "the viewer's port cannot be made");
    EXPECT_EQ(channelFaultText(ChannelFault::PortTaken), "another viewer holds the port");
    EXPECT_EQ(channelFaultText(ChannelFault::NoService), "no service");
    EXPECT_EQ(channelFaultText(ChannelFault::NoAnswer), "the service does not answer");
    EXPECT_EQ(channelFaultText(ChannelFault::BadAnswer), "the service's answer is not understood");
    EXPECT_EQ(channelFaultText(ChannelFault::Refused), "the service refuses a channel");
    EXPECT_EQ(channelFaultText(ChannelFault::NoTechnology),
              "the service speaks no known technology");
}

TEST_F(ChannelState, IsAFaultAndNoCrashWhenThereIsNoPortToAskAt)
{
    model.configureGenerator();
    EXPECT_TRUE(
        fake.log.contains(" ***** Could not send the GetTechnology command (got error=-3)"));
}

} // namespace ventrik
