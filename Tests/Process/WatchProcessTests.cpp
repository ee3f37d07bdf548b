#include "Tests/Process/LTECaptures.h"
#include "Tests/Process/ProcessFixture.h"

#include <csignal>

namespace ventrik
{

namespace
{

using testing::AllOf;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

class WatchProcess : public ProcessFixture
{
};

} // namespace

TEST_F(WatchProcess, OncePrintsATreeAndEnds)
{
    const auto service = startScenario();
    const auto watch = start("ventrik-watch", {"--once"});
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
    EXPECT_THAT(watch->output(), StartsWith("Ventrik\n"));
    EXPECT_THAT(watch->output(), HasSubstr("\n  Serving Cell Info\n"));
}

TEST_F(WatchProcess, MarksValuesThatCannotBe)
{
    const auto capture = PcapBytes(lteLinkType).record(captureStart, 0, cellInfoMessage(504));
    const auto service = startReplay("cell.pcap", capture.bytes());
    const auto watch = start("ventrik-watch", {"--once"});
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
    EXPECT_THAT(watch->output(), HasSubstr("    Physical Cell ID: 504 ⚠\n"
                                           "    Download Frequency: 1300\n"));
}

TEST_F(WatchProcess, NamesARecordWhoseLayoutIsNotKnownBelowItsSection)
{
    const Bytes unknown = PacketBuilder(0xB17F).size(60).u8(13, 7).build();
    const auto capture = PcapBytes(lteLinkType).record(captureStart, 0, unknown);
    const auto service = startReplay("unknown.pcap", capture.bytes());
    const auto watch = start("ventrik-watch", {"--once"});
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
    EXPECT_THAT(watch->output(),
                HasSubstr("\n  Serving Cell Measurements\n"
                          "    0xB17F version 7: layout not known, values may be wrong\n"
                          "    Measured RSRP"));
}

TEST_F(WatchProcess, PrintsRowsAsTheyComeAndTheEnd)
{
    const auto capture = PcapBytes(lteLinkType)
                             .record(captureStart, 0, cellInfoMessage(301))
                             .record(captureStart, 1, antennaMessage(2));
    const auto service = startReplay("cells.pcap", capture.bytes());
    const auto watch =
        start("ventrik-watch", {"--rows", "--select", "/Serving Cell Info/Physical Cell ID"});
    EXPECT_TRUE(waitUntil([&] { return watch->prints("\"text\":\"301\"}\n"); }))
        << watch->output() << watch->errors();
    watch->send(SIGTERM);
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
    const auto lines = linesOf(watch->output());
    EXPECT_THAT(lines.front(), StartsWith("{\"capture\":\"live\",\"record\":0,\"time\":\""));
    EXPECT_THAT(lines.back(), StartsWith("{\"capture\":\"live\",\"status\":\"ok\""));
    EXPECT_THAT(lines.back(), HasSubstr("\"records\":2,\"decoded\":2,"));
}

TEST_F(WatchProcess, OncePrintsTheRowsUpToTheFirstRefresh)
{
    const auto service = startScenario();
    const auto watch = start("ventrik-watch", {"--rows", "--once"});
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
    EXPECT_THAT(watch->output(), HasSubstr("\"path\":\"/Serving Cell Info/Physical Cell ID\""));
}

TEST_F(WatchProcess, WritesMetricsAlsoWhenTheServiceIsGone)
{
    auto service = startScenario();
    const auto watch = start("ventrik-watch", {"--rows", "--metrics-file", path("metrics")});
    const auto holds = [this](const char* line) {
        return waitUntil([&] { return readFile(path("metrics")).find(line) != std::string::npos; });
    };
    EXPECT_TRUE(holds("ventrik_channel_open 1\n"));
    EXPECT_TRUE(holds("ventrik_measured_rsrp_dbm{technology=\"lte\","));
    service.reset();
    EXPECT_TRUE(holds("ventrik_channel_open 0\n"));
    watch->send(SIGTERM);
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
}

TEST_F(WatchProcess, OnceLeavesTheMetricsOfTheTreeThatItPrints)
{
    const auto capture = PcapBytes(lteLinkType)
                             .record(captureStart, 0, cellInfoMessage(301))
                             .record(captureStart, 1, cellInfoMessage(302));
    const auto service = startReplay("cells.pcap", capture.bytes());
    const auto watch = start("ventrik-watch", {"--once", "--metrics-file", path("metrics")});
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
    EXPECT_THAT(watch->output(), HasSubstr("    Physical Cell ID: 302\n"));
    EXPECT_THAT(readFile(path("metrics")),
                AllOf(HasSubstr("path=\"/Serving Cell Info/Physical Cell ID\"} 302\n"),
                      HasSubstr("\nventrik_channel_messages_total 2\n")));
}

TEST_F(WatchProcess, OncePrintsItsTreeAlsoWhereNoMetricsCanBeWrittenAndSaysSo)
{
    const auto service = startScenario();
    const auto watch =
        start("ventrik-watch", {"--once", "--metrics-file", path("nowhere/metrics")});
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
    EXPECT_THAT(watch->output(), HasSubstr("\n  Serving Cell Info\n"));
    EXPECT_EQ(watch->errors(),
              "ventrik-watch: " + path("nowhere/metrics") + ": No such file or directory\n");
}

TEST_F(WatchProcess, PrintsPointsWhereThatIsAskedFor)
{
    const auto capture = PcapBytes(lteLinkType).record(captureStart, 0, cellInfoMessage(301));
    const auto service = startReplay("cells.pcap", capture.bytes());
    const auto watch = start("ventrik-watch", {"--rows", "--format", "influx", "--once"});
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
    EXPECT_THAT(watch->output(), HasSubstr("name=Physical\\ Cell\\ ID text=\"301\",number=301 "));
    EXPECT_THAT(linesOf(watch->output()).back(), StartsWith("ventrik_capture,capture=live "));
}

TEST_F(WatchProcess, ReadsRecordsAsItIsTold)
{
    const Bytes state = PacketBuilder(0xB0EE).size(32).u8(13, 2).u8(14, 3).build();
    const auto capture = PcapBytes(lteLinkType).record(captureStart, 0, state);
    const auto service = startReplay("state.pcap", capture.bytes());
    const auto watch = start("ventrik-watch", {"--once", "--records", "extended"});
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
    EXPECT_THAT(watch->output(), HasSubstr("EMM State: EMM_REGISTERED\n"));
}

TEST_F(WatchProcess, EndsOnSIGTERMAndLeavesNoSocket)
{
    const auto watch = start("ventrik-watch", {"--verbose"});
    ASSERT_TRUE(waitUntil([&] { return watch->says("Could not create the ports necessary"); }));
    watch->send(SIGTERM);
    EXPECT_EQ(watch->waitForEnd(), 0);
    EXPECT_THAT(sockets(), IsEmpty());
}

TEST_F(WatchProcess, EndsOnSIGTERMWhileItIsConnected)
{
    const auto service = startScenario();
    const auto watch = start("ventrik-watch", {"--verbose"});
    ASSERT_TRUE(waitUntil([&] { return watch->says("Starting the display update timer"); }));
    watch->send(SIGTERM);
    EXPECT_EQ(watch->waitForEnd(), 0) << watch->errors();
    // Its port has gone, and the service follows.
    EXPECT_TRUE(waitUntil([&] { return sockets().size() == 1; }));
}

TEST_F(WatchProcess, BesideAnotherOneSaysSoAndTakesOverWhenThatEnds)
{
    const auto service = startScenario();
    const auto first = start("ventrik-watch", {"--verbose"});
    ASSERT_TRUE(waitUntil([&] { return first->says("Starting the display update timer"); }));
    const auto second = start("ventrik-watch", {"--verbose"});
    ASSERT_TRUE(waitUntil([&] { return second->says("Could not create the ports necessary"); }));
    EXPECT_TRUE(second->says("<3> Could not create local message port\n"));
    EXPECT_FALSE(second->says("Starting the display update timer"));

    first->send(SIGTERM);
    EXPECT_EQ(first->waitForEnd(), 0);
    EXPECT_TRUE(waitUntil([&] { return second->prints("  Serving Cell Info\n"); }));
}

} // namespace ventrik
