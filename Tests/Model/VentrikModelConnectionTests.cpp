#include "Tests/Model/ModelFixture.h"

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::AllOf;
using testing::Contains;
using testing::ElementsAre;
using testing::Not;

class ConnectionTest : public ModelFixture
{
  protected:
    std::size_t attempts() { return fake.telephony.creationCount(); }
};

// A way to fail, the line that tells of it, and the line with which the start gives up.
struct Failure {
    std::string name;
    std::function<void(FakePlatform&)> arrange;
    std::vector<std::string> lines;
};

void PrintTo(const Failure& failure, std::ostream* stream)
{
    *stream << failure.name;
}

class StartFailureTest : public ModelFixture, public testing::WithParamInterface<Failure>
{
};

const std::string noPorts = "Could not create the ports necessary";
const std::string noGenerator = "No log generator technology works";
const std::string created = " ***** Created ports (send=%p, recv=%p)";

Bytes text(std::string_view characters)
{
    return {characters.begin(), characters.end()};
}

const Failure failures[] = {
    {"NoLocalPort",
     [](FakePlatform& fake) { fake.ports.failNextLocalPort(); },
     {"Could not create local message port", noPorts}},
    {"LocalPortExists",
     [](FakePlatform& fake) { fake.ports.reportNextLocalPortAsExisting(); },
     {"Local messsage port already exists", noPorts}},
    {"NoServerConnection",
     [](FakePlatform& fake) { fake.telephony.setServiceAvailable(false); },
     {"Could not create QXServerConnection", noPorts}},
    {"LogChannelError",
     [](FakePlatform& fake) {
         fake.telephony.queueError({1, 13});
     },
     {"_QXServerConnectionNetworkMonitorCreateLogChannel returns error: 13!", noPorts}},
    {"NoRemotePortName",
     [](FakePlatform& fake) {
         fake.telephony.queueResult({{}, std::nullopt});
     },
     {"Could not create a log channel (QX returned null port)!", noPorts}},
    {"EmptyRemotePortName",
     [](FakePlatform& fake) {
         fake.telephony.queueResult({{}, ""});
     },
     {"Could not create a log channel (QX returned null port)!", noPorts}},
    {"NobodyAtTheRemotePort",
     [](FakePlatform& fake) {
         fake.telephony.queueResult({{}, "org.ventrik.Nobody"});
     },
     {"Could not create the remote port!", noPorts}},
    {"GetTechnologyNotSent",
     [](FakePlatform& fake) { fake.ports.queueError(-2); },
     {created, " ***** Could not send the GetTechnology command (got error=-2)", noGenerator}},
    {"NoReply",
     [](FakePlatform& fake) {
         fake.ports.queueResult({PortError::success, std::nullopt});
     },
     {created, " ***** No response to GetTechnology; cannot configure", noGenerator}},
    {"GarbageReply",
     [](FakePlatform& fake) { fake.ports.queueReply(text("garbage")); },
     {created, " ***** Could not parse reply to GetTechnology; cannot configure", noGenerator}},
    {"ReplyWithoutAnswer",
     [](FakePlatform& fake) {
         fake.ports.queueReply(text("<plist version=\"1.0\"><dict/></plist>"));
     },
     {created, " ***** Reply to GetTechnology had no answer; cannot configure", noGenerator}},
    {"ReplyThatIsNoDictionary",
     [](FakePlatform& fake) {
         fake.ports.queueReply(text("<plist version=\"1.0\"><array/></plist>"));
     },
     {created, " ***** Reply to GetTechnology had no answer; cannot configure", noGenerator}},
};

} // namespace

TEST_F(ConnectionTest, AFreshModelDoesNothingByItself)
{
    fake.mainQueue.advance(60s);
    EXPECT_FALSE(model.isConnected());
    EXPECT_TRUE(fake.ports.operations().empty());
    EXPECT_EQ(model.topLevelNodes(), nullptr);
    EXPECT_FALSE(model.getSaveContents());
}

TEST_F(ConnectionTest, StartOpensTheChannelAndAsksForTheTechnologyAndStreaming)
{
    model.startMonitor();
    EXPECT_TRUE(model.isConnected());
    ASSERT_EQ(fake.ports.sends().size(), 2U);
    const RecordedSend& question = fake.ports.sends()[0];
    EXPECT_EQ(question.portName, remoteName);
    EXPECT_EQ(question.id, 0);
    EXPECT_EQ(question.data, xml(PlistDictionary{{"GetTechnology", "GetTechnology"}}));
    EXPECT_EQ(question.sendTimeout, 1.0);
    EXPECT_EQ(question.receiveTimeout, 1.0);
    EXPECT_TRUE(question.replyWanted);
}

TEST_F(ConnectionTest, TheStartCommandIsSentWithoutReply)
{
    model.startMonitor();
    ASSERT_EQ(fake.ports.sends().size(), 2U);
    const RecordedSend& command = fake.ports.sends()[1];
    EXPECT_EQ(command.id, 0);
    EXPECT_EQ(command.data,
              xml(PlistDictionary{
                  {"SetState", "Streaming"},
                  {"SetOrbelLogCodes", PlistArray{45250, 45249, 45433, 45439, 45440, 45446}},
                  {"SetQxExtraCodes", PlistArray{1, 0, 2}}}));
    EXPECT_EQ(command.sendTimeout, 1.0);
    EXPECT_EQ(command.receiveTimeout, 0.0);
    EXPECT_FALSE(command.replyWanted);
}

TEST_F(ConnectionTest, StartLogsItsSteps)
{
    model.startMonitor();
    EXPECT_THAT(errors(),
                ElementsAre(created, "Creating LTELogGenerator object",
                            "Creating OrbelLogGenerator2 object with %p", "Class Index: 1",
                            "Got log generated: %p", "Starting the display update timer"));
}

TEST_F(ConnectionTest, StartBuildsTheChannelInOrder)
{
    model.startMonitor();
    const std::string local(logChannelLocalPortName);
    const std::string remote(remoteName);
    EXPECT_THAT(fake.record->operations(),
                ElementsAre("local created " + local, "local delivering " + local,
                            "local callback set " + local, "connection created",
                            "log channel requested " + local, "connection released",
                            "remote created " + remote));
}

TEST_F(ConnectionTest, ASecondStartWhileRunningDoesNothing)
{
    model.startMonitor();
    fake.record->clear();
    fake.log.clear();
    model.startMonitor();
    EXPECT_TRUE(fake.record->operations().empty());
    EXPECT_TRUE(fake.log.lines().empty());
}

TEST_F(ConnectionTest, RestartAlwaysRebuilds)
{
    model.restartMonitor();
    const auto first = fake.ports.localPort(logChannelLocalPortName);
    model.restartMonitor();
    EXPECT_FALSE(first->isValid());
    EXPECT_NE(fake.ports.localPort(logChannelLocalPortName), first);
    EXPECT_TRUE(model.isConnected());
    EXPECT_EQ(attempts(), 2U);
}

TEST_F(ConnectionTest, TearingDownClearsEachCallbackBeforeInvalidating)
{
    model.startMonitor();
    fake.record->clear();
    fake.log.clear();
    model.destroyPorts();
    const std::string local(logChannelLocalPortName);
    const std::string remote(remoteName);
    EXPECT_THAT(fake.record->operations(),
                ElementsAre("local callback cleared " + local, "local invalidated " + local,
                            "local released " + local, "remote callback cleared " + remote,
                            "remote invalidated " + remote, "remote released " + remote));
    EXPECT_TRUE(fake.log.lines().empty());
    EXPECT_FALSE(model.isConnected());
    fake.mainQueue.advance(60s);
    EXPECT_EQ(attempts(), 1U);
}

TEST_P(StartFailureTest, IsLoggedAndTriedAgainAfter5Seconds)
{
    GetParam().arrange(fake);
    model.startMonitor();
    EXPECT_EQ(errors(), GetParam().lines);
    EXPECT_FALSE(model.isConnected());
    EXPECT_EQ(fake.ports.localPort(logChannelLocalPortName), nullptr);

    fake.telephony.setServiceAvailable(true);
    fake.mainQueue.advance(4999ms);
    EXPECT_FALSE(model.isConnected());
    fake.mainQueue.advance(1ms);
    EXPECT_TRUE(model.isConnected());
}

INSTANTIATE_TEST_SUITE_P(VentrikModel, StartFailureTest, testing::ValuesIn(failures),
                         [](const auto& test) { return test.param.name; });

TEST_F(ConnectionTest, AnUnknownTechnologyIsRetriedForEver)
{
    answerTechnology("kQXLogChannelTechnology_Unheard");
    model.startMonitor();
    EXPECT_THAT(errors(), ElementsAre(created, "Got log generated: %p", noGenerator));
    fake.mainQueue.advance(500s);
    EXPECT_EQ(attempts(), 101U);
}

TEST_F(ConnectionTest, AFailedStartCommandIsRetried)
{
    fake.ports.setSendHandler(
        [](const RecordedSend& send) -> std::optional<RemotePort::SendResult> {
            if (send.replyWanted)
                return std::nullopt;
            return RemotePort::SendResult{PortError::sendTimeout, std::nullopt};
        });
    model.startMonitor();
    EXPECT_THAT(errors(), Contains(" ***** Could not send the START command (got error=-1)"));
    EXPECT_THAT(errors(), Not(Contains("Starting the display update timer")));
    EXPECT_FALSE(model.isConnected());
    fake.mainQueue.advance(5s);
    EXPECT_EQ(attempts(), 2U);
}

TEST_F(ConnectionTest, AFailedConfigurationGoesOnWithTheEarlierGenerator)
{
    model.startMonitor();
    fake.ports.queueReply(text("garbage"));
    fake.log.clear();
    model.restartMonitor();
    EXPECT_TRUE(model.isConnected());
    EXPECT_THAT(errors(),
                ElementsAre(created,
                            " ***** Could not parse reply to GetTechnology; cannot configure",
                            "Starting the display update timer"));
}

TEST_F(ConnectionTest, ADeadRemotePortIsNoticedAtTheNextTick)
{
    model.startMonitor();
    fake.ports.killRemote(remoteName);
    fake.log.clear();
    fake.mainQueue.advance(1999ms);
    EXPECT_TRUE(fake.log.lines().empty());
    fake.mainQueue.advance(1ms);
    EXPECT_THAT(errors(), ElementsAre(" ***** INVALIDATED %p *****",
                                      "Could not create the remote port!", noPorts));
    EXPECT_FALSE(model.isConnected());
}

TEST_F(ConnectionTest, ARemotePortThatCameBackIsUsedWithinTheSameTick)
{
    model.startMonitor();
    fake.ports.killRemote(remoteName);
    fake.ports.listen(remoteName);
    fake.mainQueue.advance(2s);
    EXPECT_TRUE(model.isConnected());
    EXPECT_THAT(errors(), Contains(" ***** INVALIDATED %p *****"));
    EXPECT_EQ(fake.ports.remotePorts(remoteName).size(), 1U);
}

TEST_F(ConnectionTest, AnInvalidatedLocalPortRestartsTheMonitor)
{
    model.startMonitor();
    fake.ports.localPort(logChannelLocalPortName)->invalidate();
    EXPECT_THAT(errors(), Contains(" ***** INVALIDATED %p *****"));
    EXPECT_TRUE(model.isConnected());
    EXPECT_TRUE(fake.ports.localPort(logChannelLocalPortName)->isValid());
}

TEST_F(ConnectionTest, ANotificationDuringTheStartIsHarmless)
{
    fake.ports.setSendHandler([](const RecordedSend&) { return std::nullopt; });
    model.startMonitor();
    fake.telephony.notify();
    EXPECT_TRUE(model.isConnected());
    EXPECT_EQ(fake.telephony.liveConnectionCount(), 0U);
}

TEST_F(ConnectionTest, ARetryThatWaitsDoesNotOutliveTheModel)
{
    fake.telephony.setServiceAvailable(false);
    {
        VentrikModel shortLived(fake.platform(), {});
        shortLived.startMonitor();
    }
    fake.mainQueue.advance(60s);
    EXPECT_EQ(attempts(), 1U);
}

TEST_F(ConnectionTest, AModelThatGoesClosesAPortThatAnotherHoldsToo)
{
    std::shared_ptr<FakeLocalPort> held;
    {
        VentrikModel shortLived(fake.platform(), {});
        shortLived.startMonitor();
        held = fake.ports.localPort(logChannelLocalPortName);
        ASSERT_TRUE(held->isValid());
    }
    EXPECT_FALSE(held->isValid());
    EXPECT_FALSE(held->hasInvalidationCallback());
}

TEST_F(ConnectionTest, OnePortAloneIsNoConnection)
{
    fake.telephony.setServiceAvailable(false);
    EXPECT_FALSE(model.createPorts());
    EXPECT_TRUE(fake.ports.localPort(logChannelLocalPortName));
    EXPECT_FALSE(model.isConnected());
}

TEST_F(ConnectionTest, DestroyingTheModelClosesItsPorts)
{
    {
        VentrikModel shortLived(fake.platform(), {});
        shortLived.startMonitor();
    }
    EXPECT_EQ(fake.ports.localPort(logChannelLocalPortName), nullptr);
    EXPECT_TRUE(fake.ports.remotePorts(remoteName).empty());
    fake.mainQueue.advance(60s);
    EXPECT_EQ(attempts(), 1U);
}

// Not at the next tick, which comes after 2 s.
TEST_F(ConnectionTest, ANotificationOfTheServiceRefreshesAtOnce)
{
    fake.telephony.notifyDuringRequests();
    model.updateWithData(cellInfo(301));
    model.startMonitor();
    fake.mainQueue.run();
    EXPECT_EQ(redraws, 1);
}

TEST_F(ConnectionTest, NothingIsDeliveredFromAPortThatExistedAlready)
{
    fake.ports.reportNextLocalPortAsExisting();
    model.startMonitor();
    EXPECT_THAT(fake.ports.operations(), Not(Contains(testing::StartsWith("local delivering"))));
}

namespace
{

// A generator whose start command XML cannot carry.
class UnspeakableGenerator : public LogGenerator
{
  public:
    explicit UnspeakableGenerator(const GeneratorServices& services) : LogGenerator(services) {}

    void updateState(PlistDictionary&, ByteView) override {}
    std::optional<PlistValue> generateLogUsingState(PlistDictionary&) override { return {}; }
    PlistDictionary getStartCommand() const override { return {{"SetState", "\x01"}}; }
    PlistValue getSaveContentsFromState(const PlistDictionary&) const override { return "none"; }
};

} // namespace

TEST_F(ConnectionTest, AStartCommandThatCannotBeSerialisedIsNotSentAndTriedAgain)
{
    VentrikModel other(fake.platform(), {},
                       [](const PlistValue&, const GeneratorServices& services) {
                           return std::make_unique<UnspeakableGenerator>(services);
                       });
    other.startMonitor();
    EXPECT_TRUE(fake.log.contains(" Could not generate PLIST"));
    EXPECT_EQ(fake.ports.sends().size(), 1U); // the question for the technology
    EXPECT_FALSE(other.isConnected());
    fake.mainQueue.advance(5s);
    EXPECT_EQ(fake.log.count(" Could not generate PLIST"), 2U);
}

} // namespace ventrik
