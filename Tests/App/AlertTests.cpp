#include "Packets/PacketBuilder.h"
#include "Tests/App/AppFixture.h"

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

class FakeNotices : public Notices
{
  public:
    void post(const std::string& text) override { posted.push_back(text); }

    std::vector<std::string> posted;
};

/// The window with some alerts, over serving cells that come every two seconds.
class AlertTest : public AppFixture
{
  protected:
    AlertTest()
    {
        fake.resources.add("/res/LTE.plist", "<plist><dict><key>Serving Cell Info</key><dict>"
                                             "<key>Physical Cell ID</key><string>-</string>"
                                             "</dict></dict></plist>");
        window.emplace(fake.platform(), options());
        window->applicationDidFinishLaunching();
        fake.mainQueue.run();
    }
    VentrikAppOptions options()
    {
        VentrikAppOptions options;
        options.animation = false;
        options.windowSize = QSize(480, 640);
        options.notices = &notices;
        options.ring = [this] { ++rings; };
        for (const char* text : {"/Serving Cell Info/Physical Cell ID > 400",
                                 "/Serving Cell Info/Physical Cell ID < 100",
                                 "/Serving Cell Info/Physical Cell ID > 490"})
            options.alerts.push_back(*parseAlert(text).alert);
        return options;
    }
    void drive(std::uint16_t physicalCellId)
    {
        EXPECT_TRUE(
            fake.ports.deliver(logChannelLocalPortName, 0,
                               PacketBuilder(0xB0C2).u16(14, physicalCellId).size(38).build()));
        fake.mainQueue.run();
        fake.clock.advance(2s);
        fake.mainQueue.advance(2s);
    }
    void driveThrough(std::initializer_list<std::uint16_t> cells)
    {
        for (const std::uint16_t cell : cells)
            drive(cell);
    }

    FakeNotices notices;
    int rings = 0;
    std::optional<VentrikApp> window;
};

} // namespace

TEST_F(AlertTest, RingsAndTellsTheDesktop)
{
    driveThrough({301, 450});
    EXPECT_THAT(notices.posted, ElementsAre("Physical Cell ID is 450 (> 400)"));
    EXPECT_EQ(rings, 1);
}

TEST_F(AlertTest, IsQuietWhereNothingCrossesAThreshold)
{
    driveThrough({301, 302, 303});
    EXPECT_THAT(notices.posted, IsEmpty());
    EXPECT_EQ(rings, 0);
}

TEST_F(AlertTest, IsToldOnceInTenSecondsAtMost)
{
    driveThrough({301, 450, 301, 451});
    EXPECT_THAT(notices.posted, ElementsAre("Physical Cell ID is 450 (> 400)"));
    EXPECT_EQ(rings, 1);
    driveThrough({301, 301, 452});
    EXPECT_THAT(notices.posted,
                ElementsAre("Physical Cell ID is 450 (> 400)", "Physical Cell ID is 452 (> 400)"));
    EXPECT_EQ(rings, 2);
}

TEST_F(AlertTest, DoesNotSilenceAnotherOne)
{
    driveThrough({301, 450, 50});
    EXPECT_THAT(notices.posted,
                ElementsAre("Physical Cell ID is 450 (> 400)", "Physical Cell ID is 50 (< 100)"));
}

TEST_F(AlertTest, IsToldTogetherWithThoseThatFireAtOnce)
{
    driveThrough({301, 500});
    EXPECT_THAT(notices.posted, ElementsAre("Physical Cell ID is 500 (> 400), "
                                            "Physical Cell ID is 500 (> 490)"));
    EXPECT_EQ(rings, 1);
}

TEST_F(AlertTest, IsToldWhileTheWindowShowsAMomentOfThePast)
{
    drive(301);
    window->timeLine().pause();
    drive(450);
    EXPECT_THAT(notices.posted, ElementsAre("Physical Cell ID is 450 (> 400)"));
}

} // namespace ventrik
