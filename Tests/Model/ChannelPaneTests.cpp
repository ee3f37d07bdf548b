#include "Model/ChannelPane.h"

#include "Model/NodeRows.h"
#include "Tests/Model/ModelFixture.h"

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;

class ChannelPaneTest : public ModelFixture
{
  protected:
    ChannelPaneTest() { model.addObserver(counts); }
    ~ChannelPaneTest() override { model.removeObserver(counts); }

    void start()
    {
        model.startMonitor();
        fake.mainQueue.run();
    }
    void refresh()
    {
        fake.mainQueue.advance(2s);
        pane.takeDisplay();
    }
    // The names of the rows of a node.
    std::vector<std::string> names(const std::string& path)
    {
        std::vector<std::string> result;
        const auto node = path == "/" ? pane.topLevelNodes() : pane.nodeAtPath(path);
        for (const auto& row : rowsOf(node))
            result.push_back(row->displayName());
        return result;
    }
    std::string value(const std::string& path)
    {
        const ModelNodePointer node = pane.nodeAtPath(path);
        return node && node->value() ? *node->value() : "nothing";
    }
    // What the service answers when it is asked for its report.
    void answerReport(const PlistValue& report)
    {
        fake.ports.setSendHandler(
            [this, report](const RecordedSend& send) -> std::optional<RemotePort::SendResult> {
                const std::string text(send.data.begin(), send.data.end());
                if (text.find("GetReport") == text.npos)
                    return std::nullopt;
                ++questions;
                return RemotePort::SendResult{PortError::success,
                                              xml(PlistDictionary{{"GetReport", report}})};
            });
    }

    int questions = 0;
    ChannelCounts counts{RecordsMode::Newer};
    ChannelPane pane{model, counts, fake.clock};
};

} // namespace

TEST_F(ChannelPaneTest, IsLeftOutUntilItIsAskedFor)
{
    start();
    arrive(cellInfo(7));
    refresh();
    const auto without = names("/");
    EXPECT_THAT(without, Not(IsEmpty()));
    pane.show();
    auto with = names("/");
    EXPECT_EQ(with.back(), "Channel");
    with.pop_back();
    EXPECT_EQ(with, without);
    pane.hide();
    EXPECT_EQ(names("/"), without);
    EXPECT_EQ(pane.nodeAtPath("/Channel"), nullptr);
}

TEST_F(ChannelPaneTest, StandsAloneWhereThereIsNoDisplay)
{
    EXPECT_EQ(pane.topLevelNodes(), nullptr);
    pane.show();
    EXPECT_THAT(names("/"), ElementsAre("Channel"));
    EXPECT_EQ(value("/Channel/State"), "not open yet");
    EXPECT_EQ(value("/Channel/Last Message"), "none");
    EXPECT_EQ(value("/Channel/Last Error"), "none");
}

// The display is recorded in the history when it is asked for, which is the refresh's to do.
TEST_F(ChannelPaneTest, DoesNotAskForADisplayBeforeTheModelHasNews)
{
    start();
    pane.show();
    EXPECT_THAT(names("/"), ElementsAre("Channel"));
    EXPECT_EQ(model.getSaveContents()->array()->size(), 1U); // the version report alone
}

TEST_F(ChannelPaneTest, CountsWhatCame)
{
    start();
    arrive(cellInfo(7));
    arrive(cellInfo(8));
    arrive(Bytes{1, 2});
    fake.clock.advance(14s);
    pane.show();
    EXPECT_EQ(value("/Channel/State"), "open since 06:10:28");
    EXPECT_EQ(value("/Channel/Technology"), "LTE");
    EXPECT_EQ(value("/Channel/Messages"), "3");
    EXPECT_EQ(value("/Channel/Bytes"), "78"); // two of 38 bytes, one of 2
    EXPECT_EQ(value("/Channel/Last Message"), "06:10:28, 14 s ago");
    EXPECT_EQ(value("/Channel/Messages That Are No Records"), "1");
}

TEST_F(ChannelPaneTest, TellsOfEachCode)
{
    start();
    arrive(PacketBuilder(0xB0C2).u8(13, 2).size(38).build());
    arrive(PacketBuilder(0x1234).size(20).build());
    pane.show();
    EXPECT_THAT(names("/Channel/Records by Code"), ElementsAre("0xB0C2"));
    EXPECT_EQ(value("/Channel/Records by Code/0xB0C2"), "1");
    EXPECT_EQ(value("/Channel/About Each Code/0xB0C2/Sections"), "Serving Cell Info");
    EXPECT_EQ(value("/Channel/About Each Code/0xB0C2/Layouts/version 2, 38 bytes, base"), "1");
    EXPECT_THAT(names("/Channel/Came, Nobody Decodes"), ElementsAre("0x1234"));
    EXPECT_EQ(value("/Channel/Asked For, Never Came/0xB0C1"), "LTE master information");
    EXPECT_EQ(value("/Channel/Asked For, Never Came/0xB0C2"), "nothing");
}

TEST_F(ChannelPaneTest, IsBroughtUpToDateOnDemand)
{
    start();
    pane.show();
    arrive(cellInfo(7));
    EXPECT_EQ(value("/Channel/Messages"), "0");
    pane.update();
    EXPECT_EQ(value("/Channel/Messages"), "1");
    pane.hide();
    pane.update();
    EXPECT_FALSE(pane.isShown());
}

TEST_F(ChannelPaneTest, TellsWhyTheChannelIsDownAndWhatWentWrongLast)
{
    fake.telephony.setServiceAvailable(false);
    start();
    pane.show();
    EXPECT_EQ(value("/Channel/State"), "no service");
    EXPECT_EQ(value("/Channel/Last Error"), "06:10:28: no service");
    fake.telephony.setServiceAvailable(true);
    fake.clock.advance(5s);
    fake.mainQueue.advance(5s);
    pane.update();
    EXPECT_EQ(value("/Channel/State"), "open since 06:10:33");
    EXPECT_EQ(value("/Channel/Times Opened"), "1");
    EXPECT_EQ(value("/Channel/Last Error"), "06:10:28: no service");
}

TEST_F(ChannelPaneTest, CountsHowOftenTheChannelWasOpened)
{
    start();
    fake.ports.killRemote(remoteName);
    fake.ports.listen(remoteName);
    fake.mainQueue.advance(2s);
    pane.show();
    EXPECT_EQ(value("/Channel/Times Opened"), "2");
    EXPECT_EQ(value("/Channel/Last Error"), "06:10:28: the channel was lost");
}

TEST_F(ChannelPaneTest, ShowsWhatTheServiceTells)
{
    answerReport(PlistDictionary{{"Device", "/dev/phone"}, {"Log Masks", "refused"}});
    start();
    pane.show();
    EXPECT_EQ(value("/Channel/Service/Log Masks"), "refused");
}

TEST_F(ChannelPaneTest, AsksTheServiceOnlyWhileItIsShown)
{
    answerReport(PlistDictionary());
    start();
    arrive(cellInfo(7));
    refresh();
    pane.update();
    EXPECT_EQ(questions, 0);
    pane.show();
    pane.update();
    EXPECT_EQ(questions, 2);
}

TEST_F(ChannelPaneTest, DoesNotAskAServiceAgainThatDoesNotKnowTheQuestion)
{
    answerReport("what?");
    start();
    pane.show();
    EXPECT_EQ(value("/Channel/Service"), "tells nothing");
    pane.update();
    EXPECT_EQ(questions, 1);
    fake.ports.killRemote(remoteName);
    fake.ports.listen(remoteName);
    fake.mainQueue.advance(2s);
    pane.update();
    EXPECT_EQ(questions, 2);
}

TEST_F(ChannelPaneTest, BeginsToCountCodesAnewWithAnotherTechnology)
{
    start();
    arrive(cellInfo(7));
    counts.useGenerator(model.generator(), "lte");
    EXPECT_EQ(counts.census().kinds().size(), 1U);
    counts.useGenerator(model.generator(), "utran");
    EXPECT_TRUE(counts.census().kinds().empty());
    EXPECT_EQ(counts.messages(), 1U);
}

TEST_F(ChannelPaneTest, IsShownAndLeftOutByOneKey)
{
    EXPECT_TRUE(pane.toggle("/Somewhere"));
    EXPECT_TRUE(pane.isShown());
    EXPECT_TRUE(pane.toggle("/Somewhere")); // it is shown, but not what one is at
    EXPECT_FALSE(pane.toggle("/Channel/Service"));
    EXPECT_FALSE(pane.isShown());
}

TEST_F(ChannelPaneTest, StaysWhereItIsKept)
{
    pane.keep();
    EXPECT_TRUE(pane.toggle("/"));
    EXPECT_FALSE(pane.toggle("/Channel"));
    EXPECT_TRUE(pane.isShown());
}

TEST_F(ChannelPaneTest, HoldsItsOwnPathsOnly)
{
    EXPECT_FALSE(pane.holds("/Channel"));
    pane.show();
    EXPECT_TRUE(pane.holds("/Channel"));
    EXPECT_TRUE(pane.holds("/Channel/Service"));
    EXPECT_FALSE(pane.holds("/Channels"));
    EXPECT_FALSE(pane.holds("/"));
}

} // namespace ventrik
