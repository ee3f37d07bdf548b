#include "Tests/App/StripFixture.h"

#include <QAccessible>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using testing::ElementsAre;

class StripAccessibilityTest : public StripFixture
{
  protected:
    QAccessibleTableInterface& table()
    {
        return *QAccessible::queryAccessibleInterface(&strip)->tableInterface();
    }
    std::vector<std::string> row(int place)
    {
        std::vector<std::string> texts;
        for (int column = 0; column < table().columnCount(); ++column)
            texts.push_back(table().cellAt(place, column)->text(QAccessible::Name).toStdString());
        return texts;
    }
};

} // namespace

TEST_F(StripAccessibilityTest, TheStripTellsItsValues)
{
    EXPECT_EQ(strip.accessibleName(), "Signal strip");
    EXPECT_EQ(strip.accessibleDescription(), "RSRP -81 dBm, RSRQ -9.5 dB");
}

TEST_F(StripAccessibilityTest, TheStripTellsTheValuesAtTheCursor)
{
    strip.setSecondsFromUtc(3600);
    strip.setCursor(at(1000));
    EXPECT_EQ(strip.accessibleDescription(), "at 11:16:40.0, RSRP -100 dBm, RSRQ -9.5 dB");
}

TEST_F(StripAccessibilityTest, ItsTableHasARowForEachLine)
{
    EXPECT_EQ(table().rowCount(), 2);
    EXPECT_EQ(table().columnDescription(0), "Name");
    EXPECT_EQ(table().columnDescription(4), "Maximum");
    EXPECT_EQ(table().columnDescription(5), "");
    EXPECT_EQ(table().rowDescription(1), "RSRQ");
    EXPECT_THAT(row(0), ElementsAre("RSRP", "-81", "dBm", "-100", "-81"));
    EXPECT_THAT(row(1), ElementsAre("RSRQ", "-9.5", "dB", "-9.5", "-9.5"));
    EXPECT_EQ(table().cellAt(2, 0), nullptr);
    EXPECT_EQ(table().cellAt(0, 5), nullptr);
    EXPECT_EQ(table().cellAt(-1, 0), nullptr);
}

TEST_F(StripAccessibilityTest, MinimumAndMaximumAreThoseOfTheRange)
{
    // From 1130 s on RSRP goes from -87 to -81.
    for (int turn = 0; turn < 4; ++turn)
        key(Qt::Key_Plus);
    ASSERT_NEAR(first(), 1200 - 300 / 5.0625, 0.01);
    EXPECT_THAT(row(0), ElementsAre("RSRP", "-81", "dBm", "-86", "-81"));
}

TEST_F(StripAccessibilityTest, ALineWithoutPointsHasDashes)
{
    setLines({{"SNR", "dB", {}}}, 1200);
    EXPECT_THAT(row(0), ElementsAre("SNR", "–", "dB", "–", "–"));
}

TEST_F(StripAccessibilityTest, CellsKnowTheirPlaces)
{
    QAccessibleInterface* strips = QAccessible::queryAccessibleInterface(&strip);
    EXPECT_EQ(strips->role(), QAccessible::Table);
    EXPECT_EQ(strips->childCount(), 10);
    QAccessibleInterface* cell = strips->child(7);
    ASSERT_TRUE(cell);
    EXPECT_EQ(cell, table().cellAt(1, 2));
    EXPECT_EQ(cell->tableCellInterface()->rowIndex(), 1);
    EXPECT_EQ(cell->tableCellInterface()->columnIndex(), 2);
    EXPECT_EQ(strips->indexOfChild(cell), 7);
    EXPECT_EQ(cell->parent(), strips);
}

TEST_F(StripAccessibilityTest, CellsOfLinesThatAreGoneAreNotValid)
{
    QAccessibleInterface* cell = table().cellAt(1, 0);
    ASSERT_TRUE(cell->isValid());
    setLines({}, 1200);
    EXPECT_FALSE(cell->isValid());
    EXPECT_EQ(cell->text(QAccessible::Name), "");
    EXPECT_EQ(table().rowCount(), 0);
}

} // namespace ventrik
