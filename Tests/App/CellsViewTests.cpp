#include "App/Lists/CellsModel.h"
#include "App/Lists/CellsView.h"
#include "App/Lists/PlainHeader.h"

#include <QApplication>
#include <QClipboard>
#include <QScrollBar>
#include <QTableView>
#include <QtTest>

#include <gmock/gmock.h>

#include <algorithm>
#include <iterator>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

CellRow lteCell(CellKind kind, std::string identity, std::optional<double> level)
{
    CellRow cell{.system = CellSystem::LTE, .kind = kind};
    cell.channel = 1300;
    cell.band = "B3";
    cell.megahertz = 1815;
    cell.path = "/Cells/" + identity;
    cell.identity = std::move(identity);
    if (level) {
        cell.level = CellLevel{"RSRP", *level, "dBm"};
        cell.quality = CellLevel{"RSRQ", -7.5, "dB"};
    }
    cell.age = 2s;
    return cell;
}

std::vector<CellRow> lteCells()
{
    return {lteCell(CellKind::Neighbor, "118", -104.5), lteCell(CellKind::Candidate, "47", {}),
            lteCell(CellKind::Serving, "301", -90), lteCell(CellKind::Measured, "9", -88)};
}

class CellsViewTest : public testing::Test
{
  protected:
    CellsViewTest()
    {
        view.setOnOpen([this](const std::string& path) { opened.push_back(path); });
        show(800);
    }

    void show(int width)
    {
        view.resize(width, 300);
        view.show();
        QCoreApplication::processEvents();
    }

    std::vector<std::string> texts(int column)
    {
        std::vector<std::string> texts;
        for (int row = 0; row < view.model().rowCount(); ++row)
            texts.push_back(view.model().index(row, column).data().toString().toStdString());
        return texts;
    }
    std::vector<std::string> identities() { return texts(CellsModel::Identity); }

    std::vector<std::string> shownColumns()
    {
        std::vector<std::string> names;
        for (int column = 0; column < CellsModel::ColumnCount; ++column)
            if (!view.table().isColumnHidden(column))
                names.push_back(view.model()
                                    .headerData(column, Qt::Horizontal, Qt::DisplayRole)
                                    .toString()
                                    .toStdString());
        return names;
    }

    void clickHeader(int column)
    {
        QHeaderView& header = *view.table().horizontalHeader();
        const int x = header.sectionViewportPosition(column) + header.sectionSize(column) / 2;
        QTest::mouseClick(header.viewport(), Qt::LeftButton, {}, {x, PlainHeader::height / 2});
    }
    QPoint middleOf(int row)
    {
        return view.table().visualRect(view.model().index(row, CellsModel::Identity)).center();
    }
    void clickRow(int row)
    {
        QTest::mouseClick(view.table().viewport(), Qt::LeftButton, {}, middleOf(row));
    }
    void press(Qt::Key key) { QTest::keyClick(&view.table(), key); }
    /// The identity of the selected cell.
    std::string selected()
    {
        const QModelIndexList rows =
            view.table().selectionModel()->selectedRows(CellsModel::Identity);
        return rows.size() == 1 ? rows.front().data().toString().toStdString() : "";
    }

    std::vector<std::string> opened;
    CellsView view;
};

} // namespace

TEST_F(CellsViewTest, ShowsServingCellsFirstAndThenTheStrongest)
{
    view.setCells(lteCells());
    EXPECT_THAT(identities(), ElementsAre("301", "9", "118", "47"));
}

TEST_F(CellsViewTest, ShowsNumbersOfOneColumnWithAsManyDigits)
{
    view.setCells(lteCells());
    EXPECT_THAT(texts(CellsModel::Level), ElementsAre("-90.0", "-88.0", "-104.5", ""));
    EXPECT_THAT(texts(CellsModel::Quality), ElementsAre("-7.5", "-7.5", "-7.5", ""));
    EXPECT_THAT(texts(CellsModel::Frequency), ElementsAre("1815.0", "1815.0", "1815.0", "1815.0"));
    EXPECT_THAT(texts(CellsModel::Age), ElementsAre("2", "2", "2", "2"));
}

TEST_F(CellsViewTest, ShowsDifferencesWithTheirSign)
{
    std::vector<CellRow> cells = lteCells();
    cells[0].difference = -14.5;
    cells[3].difference = 2;
    view.setCells(cells);
    EXPECT_THAT(texts(CellsModel::Difference), ElementsAre("", "+2.0", "-14.5", ""));
}

TEST_F(CellsViewTest, ShowsAllColumnsThatSaySomethingWhereThereIsRoom)
{
    view.setCells(lteCells());
    EXPECT_THAT(shownColumns(), ElementsAre("Kind", "PCI", "Channel", "Band", "MHz", "RSRP dBm",
                                            "RSRQ dB", "Age s"));
}

TEST_F(CellsViewTest, DropsTheLeastImportantColumnsWhereThereIsLittleRoom)
{
    show(300);
    view.setCells(lteCells());
    EXPECT_THAT(shownColumns(), ElementsAre("Kind", "PCI", "RSRP dBm"));
    show(450);
    EXPECT_THAT(shownColumns(), ElementsAre("Kind", "PCI", "Channel", "RSRP dBm", "RSRQ dB"));
    show(80);
    EXPECT_THAT(shownColumns(), ElementsAre("Kind", "PCI", "RSRP dBm"));
    EXPECT_GT(view.table().horizontalScrollBar()->maximum(), 0);
}

TEST_F(CellsViewTest, DropsColumnsFromTheLeastImportantOneOn)
{
    std::vector<CellRow> cells = lteCells();
    cells[0].difference = -14.5;
    view.setCells(cells);
    std::vector<std::string> dropped;
    for (int width = 800; width >= 200; --width) {
        const std::vector<std::string> before = shownColumns();
        show(width);
        const std::vector<std::string> now = shownColumns();
        std::ranges::copy_if(before, std::back_inserter(dropped), [&](const std::string& name) {
            return std::ranges::find(now, name) == now.end() &&
                   std::ranges::find(dropped, name) == dropped.end();
        });
    }
    EXPECT_THAT(dropped, ElementsAre("Age s", "MHz", "Band", "RSRQ dB", "Δ dB", "Channel"));
}

TEST_F(CellsViewTest, FillsItsWidthWithItsColumns)
{
    for (const int width : {300, 450, 800, 1400}) {
        show(width);
        view.setCells(lteCells());
        EXPECT_EQ(view.table().horizontalHeader()->length(), view.table().viewport()->width());
        EXPECT_EQ(view.table().horizontalScrollBar()->maximum(), 0) << width;
    }
}

TEST_F(CellsViewTest, TellsSystemsApartWhereThereAreSeveral)
{
    CellRow umts{.system = CellSystem::UMTS, .kind = CellKind::Candidate};
    umts.channel = 10738;
    umts.identity = "58";
    umts.level = CellLevel{"RSCP", -80, "dBm"};
    view.setCells({lteCell(CellKind::Serving, "301", -90), umts});
    EXPECT_THAT(texts(CellsModel::Identity), ElementsAre("PCI 301", "PSC 58"));
    EXPECT_THAT(texts(CellsModel::System), ElementsAre("LTE", "UMTS"));
    EXPECT_THAT(shownColumns(), ElementsAre("Kind", "System", "Cell", "Channel", "Band", "MHz",
                                            "Level dBm", "RSRQ dB", "Age s"));
}

TEST_F(CellsViewTest, SortsByAColumnThatIsClickedUpDownAndNotAtAll)
{
    view.setCells(lteCells());
    clickHeader(CellsModel::Level);
    EXPECT_THAT(identities(), ElementsAre("118", "301", "9", "47"));
    clickHeader(CellsModel::Level);
    EXPECT_THAT(identities(), ElementsAre("9", "301", "118", "47"));
    clickHeader(CellsModel::Level);
    EXPECT_THAT(identities(), ElementsAre("301", "9", "118", "47"));
}

TEST_F(CellsViewTest, SortsIdentitiesAsNumbers)
{
    view.setCells(lteCells());
    clickHeader(CellsModel::Identity);
    EXPECT_THAT(identities(), ElementsAre("9", "47", "118", "301"));
}

TEST_F(CellsViewTest, StaysSortedAcrossRefreshes)
{
    view.setCells(lteCells());
    clickHeader(CellsModel::Level);
    std::vector<CellRow> cells = lteCells();
    cells[0].level->number = -50;
    view.setCells(cells);
    EXPECT_THAT(identities(), ElementsAre("301", "9", "118", "47"));
}

TEST_F(CellsViewTest, OpensTheCellThatIsClicked)
{
    view.setCells(lteCells());
    clickRow(2);
    EXPECT_THAT(opened, ElementsAre("/Cells/118"));
}

TEST_F(CellsViewTest, WalksByArrowsAndOpensByEnter)
{
    view.setCells(lteCells());
    view.table().setCurrentIndex(view.model().index(0, 0));
    press(Qt::Key_Down);
    EXPECT_EQ(selected(), "9");
    EXPECT_THAT(opened, IsEmpty());
    press(Qt::Key_Return);
    press(Qt::Key_Down);
    press(Qt::Key_Enter);
    press(Qt::Key_Up);
    press(Qt::Key_Up);
    EXPECT_THAT(opened, ElementsAre("/Cells/9", "/Cells/118"));
    EXPECT_EQ(selected(), "301");
}

TEST_F(CellsViewTest, KeepsTheSelectionAtItsCellAcrossRefreshes)
{
    view.setCells(lteCells());
    view.table().selectRow(2);
    ASSERT_EQ(selected(), "118");
    std::vector<CellRow> cells = lteCells();
    cells[0].level->number = -70; // the strongest neighbor now
    cells.push_back(lteCell(CellKind::Measured, "200", -60));
    cells.erase(cells.begin() + 3);
    view.setCells(cells);
    EXPECT_THAT(identities(), ElementsAre("301", "200", "118", "47"));
    EXPECT_EQ(selected(), "118");
    EXPECT_EQ(view.table().currentIndex().row(), 2);
    cells.erase(cells.begin());
    view.setCells(cells);
    EXPECT_THAT(identities(), ElementsAre("301", "200", "47"));
}

TEST_F(CellsViewTest, TellsItsTableOfCellsThatComeAndGo)
{
    view.setCells(lteCells());
    QSignalSpy came(&view.model(), &QAbstractItemModel::rowsInserted);
    QSignalSpy gone(&view.model(), &QAbstractItemModel::rowsRemoved);
    std::vector<CellRow> cells = lteCells();
    cells.erase(cells.begin());
    view.setCells(cells);
    EXPECT_EQ(gone.count(), 1);
    EXPECT_EQ(came.count(), 0);
    view.setCells(lteCells());
    EXPECT_EQ(gone.count(), 1);
    EXPECT_EQ(came.count(), 1);
}

TEST_F(CellsViewTest, OpensTheCellThatWasPressedThoughARefreshMovedIt)
{
    view.setCells(lteCells());
    QTest::mousePress(view.table().viewport(), Qt::LeftButton, {}, middleOf(1));
    std::vector<CellRow> cells = lteCells();
    cells[3].age = 3s;
    view.setCells(cells);
    QTest::mouseRelease(view.table().viewport(), Qt::LeftButton, {}, middleOf(1));
    EXPECT_THAT(opened, ElementsAre("/Cells/9"));
}

TEST_F(CellsViewTest, ShowsACellThatIsGivenTwiceOnce)
{
    std::vector<CellRow> cells = lteCells();
    cells.push_back(cells.front());
    view.setCells(cells);
    EXPECT_THAT(identities(), ElementsAre("301", "9", "118", "47"));
}

TEST_F(CellsViewTest, CopiesARowForProgramsForTables)
{
    view.setCells(lteCells());
    view.table().selectRow(0);
    QTest::keySequence(&view.table(), QKeySequence::Copy);
    EXPECT_EQ(QApplication::clipboard()->text().toStdString(),
              "Serving\t301\t1300\tB3\t1815.0\t-90.0\t-7.5\t2");
}

TEST_F(CellsViewTest, NamesWhatItShowsForThoseWhoDoNotSeeIt)
{
    view.setCells(lteCells());
    EXPECT_EQ(view.table().accessibleName(), "Cells");
    const auto spoken = [&](int column) {
        return view.model().index(0, column).data(Qt::AccessibleTextRole).toString();
    };
    EXPECT_EQ(spoken(CellsModel::Level), "RSRP dBm -90.0");
    EXPECT_EQ(spoken(CellsModel::Identity), "PCI 301");
}

TEST_F(CellsViewTest, IsDrawnInThePaletteOfTheMoment)
{
    view.setCells(lteCells());
    const auto backgroundAt = [&](int row) {
        const QImage image = view.grab().toImage();
        return image.pixelColor(2, PlainHeader::height + row * 36 + 4);
    };
    const QColor light = backgroundAt(0);
    EXPECT_EQ(light, view.palette().color(QPalette::Base));
    QPalette dark = view.palette();
    dark.setColor(QPalette::Base, QColor(20, 20, 20));
    dark.setColor(QPalette::Text, Qt::white);
    view.setPalette(dark);
    EXPECT_EQ(backgroundAt(0), QColor(20, 20, 20));
    EXPECT_EQ(backgroundAt(6), QColor(20, 20, 20)); // below the rows
    EXPECT_EQ(view.grab().toImage().pixelColor(2, 4), QColor(20, 20, 20));
}

TEST_F(CellsViewTest, DrawsALongerBarForAHigherLevel)
{
    const auto coloredIn = [&](double level) {
        view.setCells({lteCell(CellKind::Neighbor, "1", level)});
        const QImage image = view.grab().toImage();
        int colored = 0;
        for (int x = 0; x < image.width(); ++x)
            if (image.pixelColor(x, PlainHeader::height + 18).saturation() > 100)
                ++colored;
        return colored;
    };
    const int weak = coloredIn(-125);
    const int medium = coloredIn(-95);
    EXPECT_GT(weak, 0);
    EXPECT_GT(medium, weak);
    EXPECT_GT(coloredIn(-65), medium);
}

TEST_F(CellsViewTest, SaysThatThereAreNoCellsYet)
{
    const auto isBlank = [&] {
        const QImage image = view.grab().toImage();
        for (int x = 0; x < image.width(); ++x)
            for (int y = 0; y < image.height(); ++y)
                if (image.pixelColor(x, y) != view.palette().color(QPalette::Base))
                    return false;
        return true;
    };
    EXPECT_FALSE(isBlank());
    EXPECT_FALSE(view.table().horizontalHeader()->isVisible());
}

} // namespace ventrik
