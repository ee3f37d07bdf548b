#include "App/Strip/PainterCanvas.h"

#include <QImage>
#include <QPainter>

#include <gtest/gtest.h>

#include <vector>

namespace ventrik
{

namespace
{

constexpr Color red = rgb(0xff0000);

/// A white picture of 200 by 100.
class PainterCanvasTest : public testing::Test
{
  protected:
    PainterCanvasTest() { image.fill(Qt::white); }

    bool isRed(int x, int y) const { return image.pixelColor(x, y) == QColor(255, 0, 0); }
    bool isBlank(int x, int y) const { return image.pixelColor(x, y) == QColor(Qt::white); }
    bool isBlank(const QRect& area) const
    {
        for (int x = area.left(); x <= area.right(); ++x)
            for (int y = area.top(); y <= area.bottom(); ++y)
                if (!isBlank(x, y))
                    return false;
        return true;
    }
    // How often the row changes between blank and painted.
    int changesInRow(int y) const
    {
        int changes = 0;
        for (int x = 1; x < image.width(); ++x)
            changes += isBlank(x, y) != isBlank(x - 1, y) ? 1 : 0;
        return changes;
    }
    // Up and down over the whole height, with one peak to the top.
    static std::vector<Point> busyLine()
    {
        std::vector<Point> points;
        for (int x = 0; x < 200; ++x) {
            points.push_back({x + 0.2, 90.0});
            points.push_back({x + 0.4, x == 77 ? 1.0 : 50.0});
            points.push_back({x + 0.6, 50.0});
        }
        return points;
    }

    QImage image{200, 100, QImage::Format_RGB32};
    QPainter painter{&image};
    PainterCanvas canvas{painter, image.size()};
};

} // namespace

TEST_F(PainterCanvasTest, StraightLinesAreCrisp)
{
    canvas.line({10, 20.3}, {190, 20.3}, {red});
    EXPECT_TRUE(isRed(100, 20));
    EXPECT_TRUE(isBlank(100, 19));
    EXPECT_TRUE(isBlank(100, 21));
    EXPECT_TRUE(isBlank(8, 20));
    EXPECT_TRUE(isBlank(192, 20));
}

TEST_F(PainterCanvasTest, DashesLeaveSomethingOut)
{
    canvas.line({0, 20}, {200, 20}, {red, 2, Dash::Dashed});
    // 10 pixels and 6 left out, again and again.
    EXPECT_NEAR(changesInRow(20), 2 * 200 / 16, 2);
    canvas.line({0, 50}, {200, 50}, {red, 2});
    EXPECT_EQ(changesInRow(50), 0);
}

TEST_F(PainterCanvasTest, APeakOfABusyLineIsPainted)
{
    canvas.polyline(busyLine(), {red, 1.7});
    EXPECT_FALSE(isBlank(QRect(76, 0, 4, 10)));
    EXPECT_TRUE(isBlank(QRect(20, 0, 40, 40)));
    EXPECT_FALSE(isBlank(QRect(20, 60, 40, 1)));
}

TEST_F(PainterCanvasTest, APeakOfABusyDashedLineIsPainted)
{
    canvas.polyline(busyLine(), {red, 1.7, Dash::Dotted});
    EXPECT_FALSE(isBlank(QRect(76, 0, 4, 10)));
}

TEST_F(PainterCanvasTest, LeaningLinesAreSmooth)
{
    canvas.line({10, 10}, {190, 60}, {red, 2});
    EXPECT_FALSE(isBlank(QRect(95, 30, 10, 12)));
    EXPECT_TRUE(isBlank(QRect(95, 60, 10, 30)));
}

TEST_F(PainterCanvasTest, TextsStandAtTheirAnchors)
{
    canvas.text({100, 20}, "WWWW", {.color = red, .size = 12});
    EXPECT_TRUE(isBlank(QRect(0, 0, 98, 30)));
    EXPECT_FALSE(isBlank(QRect(101, 5, 20, 20)));
    canvas.text({100, 50}, "WWWW", {.color = red, .size = 12, .anchor = Anchor::End});
    EXPECT_TRUE(isBlank(QRect(102, 35, 98, 20)));
    EXPECT_FALSE(isBlank(QRect(80, 38, 19, 14)));
    canvas.text({100, 80}, "WWWW", {.color = red, .size = 12, .anchor = Anchor::Middle});
    EXPECT_FALSE(isBlank(QRect(85, 68, 10, 14)));
    EXPECT_FALSE(isBlank(QRect(105, 68, 10, 14)));
}

TEST_F(PainterCanvasTest, TurnedTextsGoUp)
{
    canvas.text({100, 90}, "WWWW", {.color = red, .size = 12, .rotation = -90});
    EXPECT_FALSE(isBlank(QRect(85, 50, 16, 38)));
    EXPECT_TRUE(isBlank(QRect(103, 0, 97, 100)));
}

TEST_F(PainterCanvasTest, NothingIsPaintedOutsideAClip)
{
    {
        const ClipScope clip(canvas, {50, 20, 20, 20});
        canvas.fillRect({0, 0, 200, 100}, red);
    }
    EXPECT_TRUE(isRed(60, 30));
    EXPECT_TRUE(isBlank(40, 30));
    canvas.fillRect({0, 0, 10, 10}, red);
    EXPECT_TRUE(isRed(5, 5));
}

TEST_F(PainterCanvasTest, RectanglesHaveTheirOutline)
{
    canvas.strokeRect({20, 20, 100, 50}, {red});
    EXPECT_TRUE(isBlank(70, 45));
    EXPECT_FALSE(isBlank(QRect(19, 45, 3, 1)));
    EXPECT_FALSE(isBlank(QRect(119, 45, 3, 1)));
    EXPECT_FALSE(isBlank(QRect(70, 69, 1, 3)));
}

TEST_F(PainterCanvasTest, BoldTextsAreMeasuredAsSuch)
{
    const FontMeasure measure;
    EXPECT_GT(measure.textWidth("-84", 12, true), 0);
    EXPECT_GE(measure.textWidth("Measured", 12, true), measure.textWidth("Measured", 12, false));
    EXPECT_DOUBLE_EQ(canvas.textWidth("-84", 12, false), measure.textWidth("-84", 12, false));
}

} // namespace ventrik
