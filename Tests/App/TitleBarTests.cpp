#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/TitleBar.h"
#include "Tests/App/TestScreen.h"

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

class TitleBarTest : public testing::Test
{
  protected:
    TitleBarTest() { showAt(bar, 390, TitleBar::barHeight); }
    // A title that wide at most and only just.
    static QString titleOfWidth(int width)
    {
        const QFont font = systemFont(17, FontWeight::Bold);
        QString title;
        while (measured(title + 'i', font).width() <= width)
            title += 'i';
        return title;
    }

    TitleBar bar{nullptr};
};

} // namespace

TEST_F(TitleBarTest, AShortTitleStandsInTheMiddleOfTheBar)
{
    bar.setTitle("Cell");
    bar.showBackButton("Ventrik");
    EXPECT_EQ(bar.titleRect().left(), bar.width() - 1 - bar.titleRect().right());
}

TEST_F(TitleBarTest, ALongTitleTakesAllThatTheWayBackLeaves)
{
    bar.showBackButton("Ventrik");
    const int room = bar.width() - bar.backButton().width() - 2 * 12;
    bar.setTitle(titleOfWidth(room));
    EXPECT_EQ(bar.titleRect().left(), bar.backButton().width() + 12);
    EXPECT_EQ(bar.titleRect().width(), room);
}

TEST_F(TitleBarTest, WithoutAWayBackTheTitleHasTheWholeBar)
{
    bar.setTitle(titleOfWidth(360));
    EXPECT_EQ(bar.titleRect().left(), 12);
    EXPECT_EQ(bar.titleRect().right(), bar.width() - 1 - 12);
}

TEST_F(TitleBarTest, ALongWayBackLeavesTheTitleTwoThirds)
{
    bar.setTitle("Cell");
    bar.showBackButton(QString(100, 'x'));
    EXPECT_EQ(bar.backButton().width(), 390 / 3);
}

} // namespace ventrik
