#include "App/Toolkit/HorizontalScrollView.h"
#include "App/VentrikCell.h"
#include "Tests/App/TestScreen.h"

#include <QFontMetrics>
#include <QGuiApplication>
#include <QLabel>
#include <QProxyStyle>
#include <QTest>

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>

namespace ventrik
{

namespace
{

QFont font15(bool bold)
{
    QFont font = QGuiApplication::font();
    font.setPixelSize(15);
    font.setBold(bold);
    return font;
}

int boldWidth(const QString& text)
{
    return QFontMetrics(font15(true)).size(Qt::TextSingleLine, text).width();
}

int boldHeight()
{
    return QFontMetrics(font15(true)).height();
}

// As the guidelines for accessible content have it.
double luminance(const QColor& color)
{
    const auto linear = [](double part) {
        return part <= 0.04045 ? part / 12.92 : std::pow((part + 0.055) / 1.055, 2.4);
    };
    return 0.2126 * linear(color.redF()) + 0.7152 * linear(color.greenF()) +
           0.0722 * linear(color.blueF());
}

double contrastBetween(const QColor& one, const QColor& other)
{
    const auto [less, more] = std::minmax({luminance(one), luminance(other)});
    return (more + 0.05) / (less + 0.05);
}

/// A platform that asks for less motion.
class StillStyle : public QProxyStyle
{
  public:
    int styleHint(StyleHint hint, const QStyleOption* option, const QWidget* widget,
                  QStyleHintReturn* result) const override
    {
        return hint == SH_Widget_Animation_Duration
                   ? 0
                   : QProxyStyle::styleHint(hint, option, widget, result);
    }
};

class VentrikCellTest : public testing::Test
{
  protected:
    // A leaf row whose content area is that wide.
    VentrikCell& leaf(const QString& key, const QString& value, int contentWidth)
    {
        cell = VentrikCell::initWithStyle(TableRow::Style::Value, "id");
        cell->setKeyText(key);
        cell->setValueText(value);
        setContentWidth(contentWidth);
        cell->setLayout();
        return *cell;
    }
    VentrikCell& inner(const QString& key, int contentWidth)
    {
        cell = VentrikCell::initWithStyleKey(TableRow::Style::Value, "id");
        cell->setKeyText(key);
        setContentWidth(contentWidth);
        cell->setLayoutKey();
        return *cell;
    }
    void setContentWidth(int contentWidth)
    {
        showAt(*cell, contentWidth, 50);
        showAt(*cell, 2 * contentWidth - cell->contentArea().width(), 50);
        ASSERT_EQ(cell->contentArea().width(), contentWidth);
    }

    // Between what stands at the right edge and the row's background.
    double contrastOfSign()
    {
        const QImage picture = cell->grab(QRect(cell->width() - 34, 5, 34, 40)).toImage();
        const QColor ground = picture.pixelColor(33, 5);
        double contrast = 1;
        for (int x = 0; x < picture.width(); ++x)
            for (int y = 0; y < picture.height(); ++y)
                contrast = std::max(contrast, contrastBetween(picture.pixelColor(x, y), ground));
        return contrast;
    }

    std::unique_ptr<VentrikCell> cell;
};

const QString name = "Average RSRP";
const QString shortValue = "-94 dBm";
const QString longValue = QString("0123456789").repeated(12);

} // namespace

TEST_F(VentrikCellTest, AnInnerRowHasTheKeyOnly)
{
    inner(name, 300);
    EXPECT_EQ(cell->value(), nullptr);
    EXPECT_EQ(cell->view(), nullptr);
    EXPECT_EQ(cell->key().parentWidget(), &cell->contentArea());
    EXPECT_EQ(cell->style(), TableRow::Style{1});
}

TEST_F(VentrikCellTest, ALeafRowHasBothLabelsInTheScrollView)
{
    leaf(name, shortValue, 300);
    EXPECT_EQ(cell->view()->parentWidget(), &cell->contentArea());
    EXPECT_EQ(cell->key().parentWidget(), &cell->view()->content());
    EXPECT_EQ(cell->value()->parentWidget(), &cell->view()->content());
}

TEST_F(VentrikCellTest, TheNameIsBoldAndTheValueRegularAtFifteen)
{
    leaf(name, shortValue, 300);
    EXPECT_EQ(cell->key().font(), font15(true));
    EXPECT_EQ(cell->value()->font(), font15(false));
}

TEST_F(VentrikCellTest, TheKeyStandsTenFromTheLeftAndCentred)
{
    inner(name, 300);
    EXPECT_EQ(cell->key().geometry(),
              QRect(10, (50 - boldHeight()) / 2, boldWidth(name), boldHeight()));
}

TEST_F(VentrikCellTest, AShortValueEndsAtTheRightEdgeMeasuredInBold)
{
    leaf(name, shortValue, 500);
    const int width = boldWidth(shortValue);
    EXPECT_EQ(cell->value()->geometry(),
              QRect(500 - width, (50 - boldHeight()) / 2, width, boldHeight()));
    EXPECT_EQ(cell->view()->contentSize(), QSize(500, 50));
    EXPECT_EQ(cell->view()->geometry(), QRect(0, 0, 500, 50));
}

TEST_F(VentrikCellTest, ALongValueFollowsTheKeyByFiftyAndScrolls)
{
    leaf(name, longValue, 300);
    EXPECT_EQ(cell->value()->x(), 10 + boldWidth(name) + 50);
    EXPECT_EQ(cell->view()->contentSize(), QSize(300 + boldWidth(name) + boldWidth(longValue), 50));
    cell->view()->setContentOffset(200);
    EXPECT_EQ(cell->view()->contentOffset(), 200);
}

TEST_F(VentrikCellTest, AValueThatJustFitsFollowsTheKeyWithoutScrolling)
{
    const int width = boldWidth(name) + 60 + boldWidth(shortValue);
    leaf(name, shortValue, width);
    EXPECT_EQ(cell->value()->x(), 10 + boldWidth(name) + 50);
    EXPECT_EQ(cell->view()->contentSize(), QSize(width, 50));
}

TEST_F(VentrikCellTest, OnePointLessMakesItScroll)
{
    const int width = boldWidth(name) + 60 + boldWidth(shortValue) - 1;
    leaf(name, shortValue, width);
    EXPECT_EQ(cell->value()->x(), 10 + boldWidth(name) + 50);
    EXPECT_EQ(cell->view()->contentSize().width(), width + boldWidth(name) + boldWidth(shortValue));
}

TEST_F(VentrikCellTest, OnePointMoreMovesItToTheRightEdge)
{
    const int width = boldWidth(name) + 60 + boldWidth(shortValue) + 1;
    leaf(name, shortValue, width);
    EXPECT_EQ(cell->value()->x(), width - boldWidth(shortValue));
}

TEST_F(VentrikCellTest, AWiderRowLaysItsValueOutAgain)
{
    leaf(name, shortValue, 400);
    setContentWidth(700);
    EXPECT_EQ(cell->value()->x(), 700 - boldWidth(shortValue));
    EXPECT_EQ(cell->view()->width(), 700);
}

TEST_F(VentrikCellTest, ALeafInARowMadeForAnInnerNodeShowsItsNameAlone)
{
    inner("Cell", 300);
    cell->setKeyText(name);
    cell->setValueText(shortValue);
    cell->setLayout();
    EXPECT_EQ(cell->value(), nullptr);
    EXPECT_EQ(cell->key().text(), name);
    EXPECT_EQ(cell->key().width(), boldWidth(name));
}

TEST_F(VentrikCellTest, RowsAreNamedForAssistiveTechnology)
{
    EXPECT_EQ(leaf(name, shortValue, 300).accessibleName(), "Average RSRP, -94 dBm");
    EXPECT_EQ(inner("Cell", 300).accessibleName(), "Cell");
}

TEST_F(VentrikCellTest, TextsAreNeverTakenForMarkup)
{
    leaf("<b>A&B</b>", "<img src=x>", 300);
    EXPECT_EQ(cell->key().textFormat(), Qt::PlainText);
    EXPECT_EQ(cell->value()->textFormat(), Qt::PlainText);
}

TEST_F(VentrikCellTest, StepsMoveALongValueSideways)
{
    leaf(name, longValue, 300);
    EXPECT_TRUE(cell->scrollSideways(3));
    EXPECT_EQ(cell->view()->contentOffset(), 120);
    EXPECT_TRUE(cell->scrollSideways(-1));
    EXPECT_EQ(cell->view()->contentOffset(), 80);
}

TEST_F(VentrikCellTest, WhatFitsDoesNotMoveSideways)
{
    leaf(name, shortValue, 500);
    EXPECT_FALSE(cell->scrollSideways(1));
    inner(name, 500);
    EXPECT_FALSE(cell->scrollSideways(1));
}

TEST_F(VentrikCellTest, ADoubtIsToldAndTakenBack)
{
    leaf(name, shortValue, 300).setDoubt("Wrong");
    EXPECT_TRUE(cell->isInDoubt());
    EXPECT_EQ(cell->toolTip(), "Wrong");
    EXPECT_EQ(cell->accessibleDescription(), "Wrong");
    EXPECT_EQ(cell->accessibleName(), "Average RSRP, -94 dBm");
    cell->setDoubt("");
    EXPECT_FALSE(cell->isInDoubt());
    EXPECT_EQ(cell->toolTip(), "");
}

TEST_F(VentrikCellTest, ADoubtStaysWhenTheRowIsSetOutAgain)
{
    leaf(name, longValue, 300).setDoubt("Wrong");
    setContentWidth(200);
    EXPECT_EQ(cell->toolTip(), "Wrong");
}

TEST_F(VentrikCellTest, ARowWithoutAValueIsNeverInDoubt)
{
    inner(longValue, 300).setDoubt("Wrong");
    EXPECT_FALSE(cell->isInDoubt());
    EXPECT_EQ(cell->toolTip(), longValue);
}

TEST_F(VentrikCellTest, AValueThatFitsWithoutASignFitsWithOne)
{
    leaf(name, shortValue, boldWidth(name) + 60 + boldWidth(shortValue));
    cell->setAccessory(TableRowAccessory::Warning);
    EXPECT_FALSE(cell->isFading());
    EXPECT_EQ(cell->value()->geometry().right() + 1, cell->contentArea().width());
    EXPECT_EQ(cell->view()->contentSize().width(), cell->contentArea().width());
}

TEST_F(VentrikCellTest, TheSignOfADoubtIsReadableOnLightOnDarkAndOnASelectedRow)
{
    leaf(name, shortValue, 300);
    cell->setAccessory(TableRowAccessory::Warning);
    for (const QPalette& palette : {QPalette(Qt::white), QPalette(QColor(30, 30, 30))}) {
        cell->setPalette(palette);
        for (const bool selected : {false, true}) {
            cell->setSelected(selected);
            EXPECT_GT(contrastOfSign(), 3.0) << palette.color(QPalette::Base).name().toStdString();
        }
    }
}

TEST_F(VentrikCellTest, ATintGoesAwayByItself)
{
    leaf(name, shortValue, 300);
    const QImage before = cell->grab().toImage();
    cell->tintValue();
    EXPECT_TRUE(cell->isTinted());
    EXPECT_NE(cell->grab().toImage(), before);
    EXPECT_TRUE(QTest::qWaitFor([this] { return !cell->isTinted(); }));
    EXPECT_EQ(cell->grab().toImage(), before);
}

TEST_F(VentrikCellTest, ATintDoesNotGoAlongToAnotherName)
{
    leaf(name, shortValue, 300);
    cell->tintValue();
    cell->setKeyText(name);
    EXPECT_TRUE(cell->isTinted());
    cell->setKeyText("Other");
    EXPECT_FALSE(cell->isTinted());
}

TEST_F(VentrikCellTest, NothingIsTintedWhereThePlatformAsksForLessMotion)
{
    leaf(name, shortValue, 300);
    StillStyle style;
    cell->setStyle(&style);
    cell->tintValue();
    EXPECT_FALSE(cell->isTinted());
}

TEST_F(VentrikCellTest, ARowWithoutAValueIsNeverTinted)
{
    inner(name, 300);
    cell->tintValue();
    EXPECT_FALSE(cell->isTinted());
}

TEST_F(VentrikCellTest, TheLayoutIsTheSameFromRightToLeft)
{
    QGuiApplication::setLayoutDirection(Qt::RightToLeft);
    leaf(name, shortValue, 500);
    QGuiApplication::setLayoutDirection(Qt::LeftToRight);
    EXPECT_EQ(cell->key().x(), 10);
    EXPECT_EQ(cell->value()->x(), 500 - boldWidth(shortValue));
}

TEST_F(VentrikCellTest, ALongValueFadesAtTheEdgeUntilItsEndIsSeen)
{
    leaf(name, longValue, 300);
    EXPECT_TRUE(cell->isFading());
    cell->view()->setContentOffset(10 + boldWidth(name) + 50 + boldWidth(longValue) - 300);
    EXPECT_FALSE(cell->isFading());
}

TEST_F(VentrikCellTest, WhatFitsDoesNotFade)
{
    leaf(name, shortValue, 300);
    EXPECT_FALSE(cell->isFading());
    inner(name, 300);
    EXPECT_FALSE(cell->isFading());
    EXPECT_EQ(cell->toolTip(), "");
}

TEST_F(VentrikCellTest, ALongNameFadesAndIsToldWholeByItsToolTip)
{
    inner(longValue, 300);
    EXPECT_TRUE(cell->isFading());
    EXPECT_EQ(cell->toolTip(), longValue);
}

TEST_F(VentrikCellTest, LineBreaksAndTabsStandAsSpaces)
{
    leaf("Two\nlines", "one\ttwo\r\nthree", 500);
    EXPECT_EQ(cell->key().text(), "Two lines");
    EXPECT_EQ(cell->value()->text(), "one two  three");
    EXPECT_EQ(cell->value()->width(), boldWidth("one two  three"));
}

TEST_F(VentrikCellTest, ValuesOfAllLengthsEndAtTheSamePlace)
{
    const auto inkEnd = [this](const QString& value) {
        leaf("", value, 500);
        const QImage picture = cell->grab().toImage();
        const QColor ground = picture.pixelColor(1, 25);
        for (int x = picture.width() - 1; x > 0; --x)
            for (int y = 5; y < 45; ++y)
                if (picture.pixelColor(x, y) != ground)
                    return x;
        return 0;
    };
    const int end = inkEnd("-9 dBm");
    EXPECT_NEAR(inkEnd("Measured at some length: -9 dBm"), end, 1);
    EXPECT_NEAR(end, 500, 4);
}

TEST_F(VentrikCellTest, AValueThatOnlyJustFitsEndsThereToo)
{
    const int width = boldWidth(name) + 60 + boldWidth(shortValue);
    leaf(name, shortValue, width);
    const int textWidth = QFontMetrics(font15(false)).size(Qt::TextSingleLine, shortValue).width();
    ASSERT_LT(textWidth, boldWidth(shortValue));
    EXPECT_EQ(cell->value()->x() + cell->value()->contentsRect().left() + textWidth, width);
}

TEST_F(VentrikCellTest, AValueThatGoesOnBeyondTheEdgeKeepsItsPlace)
{
    leaf(name, longValue, 300);
    EXPECT_EQ(cell->value()->contentsRect().left(), 0);
}

TEST_F(VentrikCellTest, TheKeyboardFrameIsWholeAlsoWhereTheEdgeFades)
{
    leaf(name, longValue, 300);
    cell->setKeyboardFrame(true);
    ASSERT_TRUE(cell->isFading());
    const QImage picture = cell->grab().toImage();
    const QColor frame = picture.pixelColor(10, 1);
    for (int x = 2; x < picture.width() - 2; ++x) {
        ASSERT_EQ(picture.pixelColor(x, 1), frame) << x;
        ASSERT_EQ(picture.pixelColor(x, picture.height() - 3), frame) << x;
    }
}

TEST_F(VentrikCellTest, AToolTipIsNoMarkup)
{
    inner("<b>" + longValue + "</b>", 300);
    EXPECT_TRUE(cell->toolTip().contains("&lt;b&gt;"));
}

TEST_F(VentrikCellTest, AValueOutOfSightIsHintedAtByDots)
{
    leaf(longValue, shortValue, 300);
    EXPECT_TRUE(cell->showsDots());
    cell->view()->setContentOffset(10 + boldWidth(longValue) + 50 - 100);
    EXPECT_FALSE(cell->showsDots());
    leaf(name, longValue, 300);
    EXPECT_FALSE(cell->showsDots());
}

} // namespace ventrik
