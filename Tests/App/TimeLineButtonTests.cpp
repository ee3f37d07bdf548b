#include "App/Strip/SignalStrip.h"
#include "Tests/App/AppFixture.h"

#include <QPushButton>
#include <QTest>

namespace ventrik
{

namespace
{

/// A window whose panes lead to the time line by a button.
class TimeLineButtonTest : public AppFixture
{
  protected:
    VentrikApp& launch(int width, bool withButton = true)
    {
        VentrikAppOptions options;
        options.animation = false;
        options.windowSize = QSize(width, 640);
        options.timeLineButton = withButton;
        window.emplace(fake.platform(), options);
        window->applicationDidFinishLaunching();
        fake.mainQueue.run();
        return *window;
    }
    /// Null where there is none.
    QPushButton* button()
    {
        for (QWidget* item : window->navController()->topScreen().toolbar().items())
            if (auto* button = qobject_cast<QPushButton*>(item))
                if (button->text() == QStringLiteral("Time Line"))
                    return button;
        return nullptr;
    }

    std::optional<VentrikApp> window;
};

} // namespace

TEST_F(TimeLineButtonTest, LeadsToTheTimeLinesScreen)
{
    launch(480);
    ASSERT_NE(button(), nullptr);
    button()->click();
    EXPECT_EQ(window->navController()->topScreen().title(), "Time Line");
    EXPECT_EQ(button(), nullptr);
}

TEST_F(TimeLineButtonTest, IsNotThereUnlessItIsAskedFor)
{
    launch(480, false);
    EXPECT_EQ(button(), nullptr);
}

TEST_F(TimeLineButtonTest, ComesAndGoesWithTheWindowsWidth)
{
    launch(900);
    EXPECT_EQ(button(), nullptr);
    window->window()->resize(480, 640);
    QTest::qWait(0);
    EXPECT_NE(button(), nullptr);
    window->window()->resize(900, 640);
    QTest::qWait(0);
    EXPECT_EQ(button(), nullptr);
}

} // namespace ventrik
