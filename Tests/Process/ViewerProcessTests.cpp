#include "Tests/Process/HeadlessViewer.h"
#include "Tests/Process/LTECaptures.h"
#include "Tests/Process/ProcessFixture.h"

#include <set>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::Lt;
using Time = TimedSystemLog::Time;

constexpr const char* cellPath = "/Serving Cell Info/Physical Cell ID";
constexpr const char* antennasPath = "/Serving Cell Info/Num Tx Antennas";
constexpr const char* invalidated = " ***** INVALIDATED ";

Time now()
{
    return std::chrono::steady_clock::now();
}

class ViewerProcess : public ProcessFixture
{
  protected:
    ProgramPointer startFirstService()
    {
        const PcapBytes capture =
            PcapBytes(lteLinkType).record(captureStart, 0, cellInfoMessage(301));
        return startReplay("first.pcap", capture.bytes());
    }
    ProgramPointer startSecondService()
    {
        const PcapBytes capture = PcapBytes(lteLinkType).record(captureStart, 0, antennaMessage(4));
        return startReplay("second.pcap", capture.bytes());
    }
    void startAndShowFirstService()
    {
        service = startFirstService();
        viewer.start();
        ASSERT_TRUE(waitUntil([this] { return viewer.comesToShow(cellPath, "301"); }));
    }
    bool waitForRestart()
    {
        return waitUntil([this] { return !viewer.log().timesOf(invalidated).empty(); });
    }

    ProgramPointer service;
    HeadlessViewer viewer{runtimeDirectory()};
};

} // namespace

TEST_F(ViewerProcess, ShowsValuesOfTheServiceWithinFourSeconds)
{
    service = startScenario();
    const Time start = now();
    viewer.start();
    EXPECT_TRUE(waitUntil([this] { return !viewer.shown(cellPath).empty(); }));
    EXPECT_THAT(now() - start, Lt(4s));
    EXPECT_NE(viewer.shown(cellPath), "-");
    EXPECT_THAT(viewer.errors(),
                testing::IsSupersetOf({"Starting the display update timer", "Got log generated: %p",
                                       " ***** Created ports (send=%p, recv=%p)"}));
}

TEST_F(ViewerProcess, ShowsAC2KService)
{
    service = startService({"--technology", "c2k"});
    viewer.start();
    EXPECT_TRUE(waitUntil([this] { return viewer.comesToShow("/1x/State", "Paging [6]"); }));
    EXPECT_EQ(viewer.shown("/1x/System/System ID"), "4139");
}

TEST_F(ViewerProcess, ShowsACellMonitorService)
{
    service = startService({"--technology", "ifx"});
    viewer.start();
    EXPECT_TRUE(waitUntil([this] { return viewer.comesToShow("/Serving Cell/MCC", "262"); }));
    EXPECT_EQ(viewer.shown("/Registration"), "Registered, home");
}

TEST_F(ViewerProcess, ShowsAnotherTechnologyFromItsStart)
{
    startAndShowFirstService();
    service->kill();
    service = startService({"--technology", "ifx"});
    EXPECT_TRUE(waitUntil([this] { return viewer.comesToShow("/Serving Cell/MCC", "262"); }));
    EXPECT_EQ(viewer.shown(cellPath), "");
}

TEST_F(ViewerProcess, ShowsValuesThatChange)
{
    service = startScenario();
    viewer.start();
    std::set<std::string> values;
    EXPECT_TRUE(waitUntil([&] {
        viewer.refreshNow();
        values.insert(viewer.shown("/Serving Cell Measurements/Measured RSRP"));
        return values.size() >= 4;
    }));
}

TEST_F(ViewerProcess, KeepsAHistoryOfFiveAndSavesADLF)
{
    service = startScenario();
    viewer.start();
    // More trees than the history holds; each save carries the DLF behind the history.
    EXPECT_TRUE(waitUntil([this] {
        viewer.refreshNow();
        return viewer.redraws() >= 8;
    }));
    const PlistArray contents = viewer.saveContents();
    ASSERT_EQ(contents.size(), 6U);
    for (std::size_t i = 0; i < 5; ++i)
        EXPECT_TRUE(contents[i].dictionary()->contains("DisplayState"));
    const PlistValue* dlf = contents[5].dictionary()->find("DLF");
    ASSERT_TRUE(dlf && dlf->data());
    EXPECT_THAT(dlf->data()->size(), testing::Gt(161U)); // the version record and packets
}

TEST_F(ViewerProcess, NoticesWithinATickThatTheServiceWasKilled)
{
    startAndShowFirstService();
    service->kill();
    const Time killed = now();
    EXPECT_TRUE(waitForRestart());
    EXPECT_THAT(now() - killed, Lt(isSanitized ? 4000ms : 2500ms));
    EXPECT_FALSE(viewer.isConnected());
    EXPECT_EQ(viewer.shown(cellPath), "301");
    EXPECT_THAT(viewer.errors(), testing::IsSupersetOf({" ***** INVALIDATED %p *****",
                                                        "Could not create QXServerConnection",
                                                        "Could not create the ports necessary"}));
}

TEST_F(ViewerProcess, ShowsNewDataSoonWhenAKilledServiceIsBackAtOnce)
{
    startAndShowFirstService();
    service->kill();
    service = startSecondService();
    const Time back = now();
    EXPECT_TRUE(waitUntil([this] { return viewer.shown(antennasPath) == "4"; }));
    EXPECT_THAT(now() - back, Lt(isSanitized ? 8s : 6s));
    EXPECT_EQ(viewer.log().timesOf(invalidated).size(), 1U);
}

TEST_F(ViewerProcess, GoesOnWithItsDisplayAndHistoryWhenAKilledServiceIsBackLater)
{
    startAndShowFirstService();
    service->kill();
    ASSERT_TRUE(waitForRestart());
    EXPECT_FALSE(sockets().empty()) << "a killed service leaves its socket";
    service = startSecondService();
    const Time back = now();

    // At worst the retry has just been put off by 5 s, and the next tick is 2 s behind it.
    EXPECT_TRUE(waitUntil([this] { return viewer.shown(antennasPath) == "4"; }));
    EXPECT_THAT(now() - back, Lt(isSanitized ? 9s : 7500ms));
    // The second service never told the cell: that is the display of the first, going on.
    EXPECT_EQ(viewer.shown(cellPath), "301");
    const PlistArray contents = viewer.saveContents();
    ASSERT_EQ(contents.size(), 3U);
    EXPECT_EQ(*contents[0].dictionary()->find("DisplayState")->data(), cellInfoMessage(301));
    EXPECT_EQ(*contents[1].dictionary()->find("DisplayState")->data(), antennaMessage(4));
}

TEST_F(ViewerProcess, RestartsAfterEachOfSeveralKills)
{
    startAndShowFirstService();
    for (std::size_t kills = 1; kills <= 2; ++kills) {
        service->kill();
        service = startFirstService();
        EXPECT_TRUE(waitUntil([&] {
            return viewer.log().timesOf("Starting the display update timer").size() == kills + 1;
        }));
    }
    EXPECT_TRUE(viewer.isConnected());
}

} // namespace ventrik
