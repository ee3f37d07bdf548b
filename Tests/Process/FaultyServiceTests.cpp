#include "Tests/Process/HeadlessViewer.h"
#include "Tests/Process/ProcessFixture.h"

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::AllOf;
using testing::ElementsAre;
using testing::Ge;
using testing::Le;
using Time = TimedSystemLog::Time;

constexpr const char* createdPorts = " ***** Created ports (send=%p, recv=%p)";
constexpr const char* noPorts = "Could not create the ports necessary";
constexpr const char* noGenerator = "No log generator technology works";

// Nothing may come early; what comes late waits for the processor.
auto isAbout(Time::duration time)
{
    return AllOf(Ge(time - 20ms), Le(time + (isSanitized ? 2000ms : 1000ms)));
}

class FaultyService : public ProcessFixture
{
  protected:
    /// Starts the viewer with such a service and waits for the line that ends its first attempt.
    void startViewer(const std::string& mode, const std::string& lastLine)
    {
        service = startFaulty(mode);
        viewer.start();
        ASSERT_TRUE(waitUntil([&] { return viewer.log().contains(lastLine); })) << mode;
        EXPECT_FALSE(viewer.isConnected());
    }
    void replaceService()
    {
        EXPECT_TRUE(service->isRunning()) << service->errors();
        service->kill();
        service = startScenario();
    }
    bool showsData()
    {
        return waitUntil([this] { return viewer.comesToShow("/Serving Cell Info/Cell Identity"); });
    }
    /// With a good service in its place, the next retry shows data.
    void expectRecovery()
    {
        replaceService();
        viewer.retryNow();
        EXPECT_TRUE(showsData());
    }
    /// The same, with the viewer's own retry.
    void expectRecoveryByItself(const std::string& failure)
    {
        replaceService();
        EXPECT_TRUE(showsData());
        const Time failed = viewer.log().timesOf(failure).front();
        const Time retried = viewer.log().timesOf(" ***** Created ports").back();
        EXPECT_THAT(retried - failed, isAbout(5s));
        EXPECT_EQ(viewer.log().timesOf(failure).size(), 1U);
    }

    ProgramPointer service;
    HeadlessViewer viewer{runtimeDirectory()};
};

} // namespace

TEST_F(FaultyService, ThatIsMissingIsRetriedEveryFiveSeconds)
{
    viewer.start();
    ASSERT_TRUE(waitUntil([this] { return viewer.log().count(noPorts) == 2; }));
    EXPECT_THAT(viewer.errors(), ElementsAre("Could not create QXServerConnection", noPorts,
                                             "Could not create QXServerConnection", noPorts));
    const auto times = viewer.log().timesOf(noPorts);
    EXPECT_THAT(times[1] - times[0], isAbout(5s));
    service = startScenario();
    viewer.retryNow();
    EXPECT_TRUE(showsData());
}

TEST_F(FaultyService, ThatIsSilentHoldsTheViewerForOneSecond)
{
    service = startFaulty("silent");
    const Time begin = std::chrono::steady_clock::now();
    viewer.retryNow();
    EXPECT_THAT(std::chrono::steady_clock::now() - begin, isAbout(1s));
    EXPECT_THAT(viewer.errors(),
                ElementsAre("_QXServerConnectionNetworkMonitorCreateLogChannel returns error: 2!",
                            noPorts));
    expectRecoveryByItself(noPorts);
}

TEST_F(FaultyService, ThatKeepsItsTechnologySilentHoldsTheViewerForOneSecond)
{
    startViewer("silent-technology", noGenerator);
    EXPECT_THAT(viewer.errors(),
                ElementsAre(createdPorts,
                            " ***** Could not send the GetTechnology command (got error=-2)",
                            noGenerator));
    const Time asked = viewer.log().timesOf(" ***** Created ports").front();
    const Time gaveUp = viewer.log().timesOf(" ***** Could not send").front();
    EXPECT_THAT(gaveUp - asked, isAbout(1s));
    expectRecovery();
}

TEST_F(FaultyService, ThatAnswersGarbageIsRefused)
{
    startViewer("garbage", noGenerator);
    EXPECT_THAT(viewer.errors(),
                ElementsAre(createdPorts,
                            " ***** Could not parse reply to GetTechnology; cannot configure",
                            noGenerator));
    expectRecovery();
}

TEST_F(FaultyService, ThatAnswersWithoutATechnologyIsRefused)
{
    startViewer("no-answer", noGenerator);
    EXPECT_THAT(viewer.errors(),
                ElementsAre(createdPorts,
                            " ***** Reply to GetTechnology had no answer; cannot configure",
                            noGenerator));
    expectRecovery();
}

TEST_F(FaultyService, ThatRepliesWithoutDataIsRefused)
{
    startViewer("no-reply", noGenerator);
    EXPECT_THAT(viewer.errors(),
                ElementsAre(createdPorts, " ***** No response to GetTechnology; cannot configure",
                            noGenerator));
    expectRecovery();
}

TEST_F(FaultyService, ThatSpeaksAnUnknownTechnologyIsRefused)
{
    startViewer("unknown", noGenerator);
    EXPECT_THAT(viewer.errors(), ElementsAre(createdPorts, "Got log generated: %p", noGenerator));
    EXPECT_TRUE(viewer.log().contains("Got log generated: 0x0"));
    expectRecovery();
}

TEST_F(FaultyService, ThatRefusesALogChannelIsToldWithItsCode)
{
    startViewer("refuse", noPorts);
    EXPECT_THAT(viewer.errors(),
                ElementsAre("_QXServerConnectionNetworkMonitorCreateLogChannel returns error: 13!",
                            noPorts));
    expectRecoveryByItself(noPorts);
}

TEST_F(FaultyService, ThatNamesAnEmptyPortGivesNoChannel)
{
    startViewer("empty-name", noPorts);
    EXPECT_THAT(viewer.errors(),
                ElementsAre("Could not create a log channel (QX returned null port)!", noPorts));
    expectRecovery();
}

TEST_F(FaultyService, ThatNamesNoPortGivesNoChannel)
{
    startViewer("no-name", noPorts);
    EXPECT_THAT(viewer.errors(),
                ElementsAre("Could not create a log channel (QX returned null port)!", noPorts));
    expectRecovery();
}

TEST_F(FaultyService, ThatNamesADeadPortGivesNoRemotePort)
{
    startViewer("dead-name", noPorts);
    EXPECT_THAT(viewer.errors(), ElementsAre("Could not create the remote port!", noPorts));
    expectRecovery();
}

TEST_F(FaultyService, OfAnotherUserRefusesALogChannel)
{
    startViewer("foreign", noPorts);
    EXPECT_THAT(viewer.errors(),
                ElementsAre("_QXServerConnectionNetworkMonitorCreateLogChannel returns error: 1!",
                            noPorts));
    expectRecovery();
}

TEST_F(FaultyService, ThatStreamsGarbageDoesNotHideTheGoodPackets)
{
    service = startFaulty("garbage-stream");
    viewer.start();
    EXPECT_TRUE(waitUntil(
        [this] { return viewer.comesToShow("/Serving Cell Info/Physical Cell ID", "301"); }));
    EXPECT_TRUE(viewer.isConnected());
    EXPECT_TRUE(viewer.log().contains("Invalid log type: 7. Dropping."));
    EXPECT_EQ(viewer.log().count("Cell Info Array data could not be constructed"), 2U);

    replaceService();
    EXPECT_TRUE(waitUntil(
        [this] { return viewer.comesToShow("/Serving Cell Info/Download Frequency", "1300"); }));
}

} // namespace ventrik
