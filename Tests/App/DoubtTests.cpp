#include "App/VentrikCell.h"
#include "Packets/PacketBuilder.h"
#include "Tests/App/AppFixture.h"
#include "Tests/App/TestScreen.h"

#include <QClipboard>
#include <QGuiApplication>
#include <QHelpEvent>
#include <QToolTip>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

constexpr std::string_view cellTemplate = "<plist><dict><key>Serving Cell Info</key><dict>"
                                          "<key>Physical Cell ID</key><string>-</string>"
                                          "<key>Download Frequency</key><string>-</string>"
                                          "<key>More</key><dict/>"
                                          "</dict></dict></plist>";
const QString identityDoubt = "Physical cell identity is above 503";

/// The application's pane of the serving cell.
class DoubtTest : public AppFixture
{
  protected:
    void openCell(std::uint16_t identity, int width = 390)
    {
        fake.resources.add("/res/LTE.plist", cellTemplate);
        launchAndConnect();
        showAt(*app.window(), width, 640);
        update(identity);
        openRow(0);
        QCoreApplication::processEvents();
    }
    // The next tick shows it.
    void update(std::uint16_t identity)
    {
        const Bytes message =
            PacketBuilder(0xB0C2).u16(14, identity).u16(16, 1300).size(38).build();
        EXPECT_TRUE(fake.ports.deliver(logChannelLocalPortName, 0, message));
        fake.mainQueue.advance(2s);
    }
    VentrikCell& cell(int row)
    {
        return static_cast<VentrikCell&>(*topPane().table().rowAt({0, row}));
    }
    // What a pointer that rests on the widget is told.
    static QString tipOver(QWidget& widget)
    {
        const QPoint place = widget.rect().center();
        QHelpEvent rests(QEvent::ToolTip, place, widget.mapToGlobal(place));
        QCoreApplication::sendEvent(&widget, &rests);
        return rests.isAccepted() ? QToolTip::text() : QString();
    }
    // Of that, what stands before where the value comes from.
    static QString doubtOver(QWidget& widget)
    {
        const QString tip = tipOver(widget);
        const qsizetype source = ('\n' + tip).indexOf("\n0xB0C2");
        return source < 0 ? tip : tip.left(std::max<qsizetype>(0, source - 1));
    }
};

class DoubtAtWidthTest : public DoubtTest, public testing::WithParamInterface<int>
{
};

} // namespace

TEST_F(DoubtTest, AValueThatCannotBeStandsThereUnchangedWithASign)
{
    openCell(504);
    EXPECT_EQ(cell(0).value()->text(), "504");
    EXPECT_EQ(cell(0).accessory(), TableRowAccessory::Warning);
}

TEST_F(DoubtTest, OtherRowsHaveNoSign)
{
    openCell(504);
    EXPECT_EQ(cell(1).accessory(), TableRowAccessory::None);
    EXPECT_EQ(cell(1).toolTip(), "");
    EXPECT_EQ(cell(1).accessibleDescription(), "");
    EXPECT_EQ(cell(2).accessory(), TableRowAccessory::DisclosureIndicator);
}

TEST_F(DoubtTest, ThePointerIsToldWhatIsWrongOnAnyPartOfTheRow)
{
    openCell(504);
    EXPECT_EQ(doubtOver(cell(0)), identityDoubt);
    EXPECT_EQ(doubtOver(*cell(0).value()), identityDoubt);
    EXPECT_EQ(doubtOver(cell(0).key()), identityDoubt);
    EXPECT_EQ(doubtOver(cell(1)), "");
}

TEST_F(DoubtTest, AssistiveTechnologyIsToldWhatIsWrong)
{
    openCell(504);
    EXPECT_EQ(cell(0).accessibleName(), "Physical Cell ID, 504");
    EXPECT_EQ(cell(0).accessibleDescription(), identityDoubt);
}

TEST_F(DoubtTest, TheSignComesAndGoesWithTheValue)
{
    openCell(503);
    EXPECT_EQ(cell(0).accessory(), TableRowAccessory::None);
    update(504);
    EXPECT_EQ(cell(0).accessory(), TableRowAccessory::Warning);
    update(503);
    EXPECT_EQ(cell(0).accessory(), TableRowAccessory::None);
    EXPECT_EQ(doubtOver(cell(0)), "");
    EXPECT_EQ(cell(0).accessibleDescription(), "");
}

TEST_F(DoubtTest, CopyingTheRowCopiesTheValueAsItIs)
{
    openCell(504);
    QTest::keyClick(&topPane().table(), Qt::Key_Home);
    QTest::keySequence(&topPane().table(), QKeySequence::Copy);
    EXPECT_EQ(QGuiApplication::clipboard()->text(), "Physical Cell ID: 504");
}

TEST_F(DoubtTest, WithoutAModelNothingIsInDoubt)
{
    openCell(504);
    app.applicationWillTerminate();
    EXPECT_EQ(app.doubtAt("/Serving Cell Info/Physical Cell ID"), "");
    EXPECT_TRUE(app.layoutWarningsAt("/Serving Cell Info").empty());
}

TEST_P(DoubtAtWidthTest, TheSignStandsBehindTheValueAndBothAreInSight)
{
    openCell(504, GetParam());
    ASSERT_EQ(cell(0).width(), GetParam());
    const QLabel& value = *cell(0).value();
    const int valueEnd = value.mapTo(&cell(0), QPoint(value.width(), 0)).x();
    EXPECT_FALSE(cell(0).isFading());
    EXPECT_EQ(valueEnd, GetParam() - 34);
    const QImage picture = cell(0).grab(QRect(valueEnd + 2, 10, 32, 30)).toImage();
    EXPECT_NE(picture, cell(1).grab(QRect(valueEnd + 2, 10, 32, 30)).toImage());
}

TEST_P(DoubtAtWidthTest, OrdinaryRowsAreSetOutAsEver)
{
    openCell(504, GetParam());
    const QRect value = cell(1).value()->geometry();
    update(503);
    EXPECT_EQ(cell(1).value()->geometry(), value);
    EXPECT_EQ(value.right() + 1, GetParam() - 10);
}

INSTANTIATE_TEST_SUITE_P(NarrowAndWide, DoubtAtWidthTest, testing::Values(320, 390, 839));

} // namespace ventrik
