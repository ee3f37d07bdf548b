#include "Tests/Model/ModelFixture.h"

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

const std::string cellIdPath = "/Serving Cell Info/Physical Cell ID";

class DisplayTest : public ModelFixture
{
  protected:
    std::string valueAt(const std::string& path)
    {
        const auto node = model.nodeAtPath(path);
        return node && node->value() ? *node->value() : "(none)";
    }
    // The history is what the save contents hold before the DLF entry.
    std::size_t historySize() { return model.getSaveContents()->array()->size() - 1; }
};

} // namespace

TEST_F(DisplayTest, DataIsShownAtTheNextTick)
{
    model.startMonitor();
    arrive(cellInfo(301));
    EXPECT_EQ(redraws, 0);
    fake.mainQueue.advance(2s);
    EXPECT_EQ(redraws, 1);
    EXPECT_EQ(valueAt(cellIdPath), "301");
}

TEST_F(DisplayTest, TicksWithoutDataAskForNoRedraw)
{
    model.startMonitor();
    arrive(cellInfo(301));
    fake.mainQueue.advance(20s);
    EXPECT_EQ(redraws, 1);
}

TEST_F(DisplayTest, TheRedrawIsQueuedNotCalled)
{
    model.startMonitor();
    arrive(cellInfo(301));
    model.refresh();
    EXPECT_EQ(redraws, 0);
    fake.mainQueue.run();
    EXPECT_EQ(redraws, 1);
}

TEST_F(DisplayTest, TheTreeIsKeptUntilARefreshWithNews)
{
    model.startMonitor();
    arrive(cellInfo(301));
    const auto tree = model.topLevelNodes();
    arrive(cellInfo(302));
    EXPECT_EQ(model.topLevelNodes(), tree);
    EXPECT_EQ(valueAt(cellIdPath), "301");
    model.refresh();
    EXPECT_NE(model.topLevelNodes(), tree);
    EXPECT_EQ(valueAt(cellIdPath), "302");
}

TEST_F(DisplayTest, EachTreeBuildAddsOneHistoryEntry)
{
    model.startMonitor();
    for (int i = 0; i < 3; ++i) {
        arrive(cellInfo(301));
        model.refresh();
        model.topLevelNodes();
        model.nodeAtPath("/");
    }
    EXPECT_EQ(historySize(), 3U);
}

TEST_F(DisplayTest, NodesAreFoundByPath)
{
    model.startMonitor();
    arrive(cellInfo(301));
    EXPECT_EQ(model.nodeAtPath("/"), model.topLevelNodes());
    EXPECT_EQ(model.nodeAtPath("/Serving Cell Info")->displayName(), "Serving Cell Info");
    EXPECT_EQ(model.nodeAtPath("/Nowhere"), nullptr);
}

TEST_F(DisplayTest, MessagesWithAnotherIdAreIgnored)
{
    model.startMonitor();
    arrive(cellInfo(301), 1);
    fake.mainQueue.advance(2s);
    EXPECT_EQ(redraws, 0);
}

TEST_F(DisplayTest, TheLocalPortNeverReplies)
{
    model.startMonitor();
    bool answered = false;
    std::optional<Bytes> answer = Bytes{1};
    fake.ports.deliver(logChannelLocalPortName, 0, cellInfo(301),
                       [&](const std::optional<Bytes>& reply) {
                           answered = true;
                           answer = reply;
                       });
    fake.mainQueue.run();
    EXPECT_TRUE(answered);
    EXPECT_FALSE(answer);
}

TEST_F(DisplayTest, DataWithoutAGeneratorStillAsksForARedraw)
{
    model.updateWithData(cellInfo(301));
    model.refresh();
    fake.mainQueue.run();
    EXPECT_EQ(redraws, 1);
    EXPECT_EQ(model.topLevelNodes(), nullptr);
    EXPECT_EQ(model.nodeAtPath("/"), nullptr);
}

TEST_F(DisplayTest, HistoryAndValuesOutliveARestart)
{
    model.startMonitor();
    arrive(cellInfo(301));
    model.refresh();
    model.topLevelNodes();
    model.restartMonitor();
    EXPECT_EQ(valueAt(cellIdPath), "301");
    EXPECT_EQ(historySize(), 1U);

    arrive(cellInfo(302));
    model.refresh();
    EXPECT_EQ(valueAt(cellIdPath), "302");
    EXPECT_EQ(historySize(), 2U);
}

TEST_F(DisplayTest, SaveContentsComeFromTheGenerator)
{
    model.startMonitor();
    arrive(cellInfo(301));
    model.topLevelNodes();
    const auto contents = model.getSaveContents();
    ASSERT_EQ(contents->array()->size(), 2U);
    // 161 bytes of version report and the 38-byte packet without its first byte.
    EXPECT_EQ(*(*contents->array())[1].dictionary()->find("Description"),
              PlistValue("DLF binary (198 bytes)"));
}

TEST_F(DisplayTest, TheFaultOfTheDisplayIsTheGenerators)
{
    EXPECT_EQ(model.displayFault(), "");
    fake.resources.remove(fake.resources.path("LTE", "plist").value());
    model.startMonitor();
    arrive(cellInfo(301));
    EXPECT_EQ(model.displayFault(), "display template LTE.plist is missing");
}

TEST_F(DisplayTest, ARedrawThatWaitsDoesNotOutliveTheModel)
{
    int late = 0;
    {
        VentrikModel shortLived(fake.platform(), [&] { ++late; });
        shortLived.updateWithData({});
        shortLived.refresh();
    }
    fake.mainQueue.run();
    EXPECT_EQ(late, 0);
}

} // namespace ventrik
