#include "App/VentrikSaveViewController.h"
#include "PropertyList/PropertyListReader.h"
#include "Tests/App/TestScreen.h"
#include "Tests/Support/FakePlatform.h"

#include <QApplication>
#include <QClipboard>
#include <QLabel>
#include <QLineEdit>
#include <QMessageBox>
#include <QMouseEvent>
#include <QPushButton>
#include <QTemporaryDir>
#include <QTest>

#include <filesystem>
#include <fstream>
#include <set>
#include <utility>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

PlistDictionary entry(const std::string& description)
{
    return {{"Description", description}};
}

PlistArray history()
{
    return {entry("Snapshot (2026-11-16 06:10:26 +0000)"), entry("DLF binary (161 bytes)")};
}

class SaveScreenTest : public testing::Test, public VentrikSaveHost
{
  protected:
    SaveScreenTest()
    {
        stack.setAnimationEnabled(false);
        showAt(stack, 390, 780);
    }
    void closeSaveView() override { ++closings; }
    void snapshotSaved(const std::string& fileName) override { savedFiles.push_back(fileName); }

    VentrikSaveViewController& open(const std::optional<PlistValue>& saveContents)
    {
        screen = VentrikSaveViewController::initWithSaveHistory(*this, fake.platform(), directory,
                                                                saveContents);
        stack.present(*screen, false);
        QCoreApplication::processEvents();
        return *screen;
    }
    TableRow& row(int index) { return *screen->saveContentTable().rowAt({0, index}); }
    bool fieldHasFocus() { return screen->saveDescription().hasFocus(); }
    void type(const QString& text)
    {
        screen->saveDescription().setFocus();
        QTest::keyClicks(&screen->saveDescription(), text);
    }
    void saveDescriptionByPaste(const QString& text)
    {
        QGuiApplication::clipboard()->setText(text);
        screen->saveDescription().paste();
    }
    void press(QPushButton& button) { QTest::mouseClick(&button, Qt::LeftButton); }

    std::set<std::string> files() const
    {
        std::set<std::string> names;
        std::error_code error;
        for (const auto& file : std::filesystem::directory_iterator(directory, error))
            names.insert(file.path().filename());
        return names;
    }
    PlistDictionary saved(const std::string& name = "VentrikSnapshot-1794809428.ventrik") const
    {
        std::ifstream file(directory + "/" + name, std::ios::binary);
        const Bytes bytes{std::istreambuf_iterator<char>(file), {}};
        const auto reading = readPropertyList(bytes);
        EXPECT_TRUE(reading) << reading.error;
        return reading ? *reading.value->dictionary() : PlistDictionary();
    }
    QMessageBox* alert() const { return stack.findChild<QMessageBox*>(); }

    FakePlatform fake;
    QTemporaryDir temporary;
    std::string directory = temporary.filePath("logs").toStdString();
    Events events;
    NavigationStack stack{std::make_unique<TestScreen>("Root", events)};
    int closings = 0;
    std::vector<std::string> savedFiles;
    std::unique_ptr<VentrikSaveViewController> screen;
};

} // namespace

TEST_F(SaveScreenTest, EveryEntryIsListedWithACheckMark)
{
    open(history());
    ASSERT_EQ(screen->saveContentTable().visibleRows().size(), 2U);
    EXPECT_EQ(row(0).textLabel().text(), "Snapshot (2026-11-16 06:10:26 +0000)");
    EXPECT_EQ(row(1).textLabel().text(), "DLF binary (161 bytes)");
    for (const int index : {0, 1}) {
        EXPECT_EQ(row(index).accessory(), TableRowAccessory::CheckMark);
        EXPECT_EQ(row(index).style(), TableRow::Style::Default);
        EXPECT_EQ(row(index).reuseIdentifier(), "SaveHistoryContentCell");
        EXPECT_EQ(row(index).textLabel().font().family(), "Helvetica");
        EXPECT_EQ(row(index).textLabel().font().pixelSize(), 13);
    }
}

TEST_F(SaveScreenTest, TheTableIsAsHighAsItsContent)
{
    open(history());
    EXPECT_EQ(screen->saveContentTable().height(), 100);
}

TEST_F(SaveScreenTest, AnEmptyHistoryShowsAnEmptyTable)
{
    open(PlistArray());
    EXPECT_TRUE(screen->saveContentTable().isVisible());
    EXPECT_GT(screen->saveContentTable().height(), 0);
    EXPECT_THAT(screen->saveContentTable().visibleRows(), IsEmpty());
}

TEST_F(SaveScreenTest, AnEntryWithoutADescriptionHasAnEmptyRow)
{
    open(PlistArray{PlistDictionary(), 7});
    EXPECT_EQ(row(0).textLabel().text(), "");
    EXPECT_EQ(row(1).textLabel().text(), "");
}

TEST_F(SaveScreenTest, CoversTheWholeWindow)
{
    EXPECT_EQ(open(history()).geometry(), QRect(0, 0, 390, 780));
}

TEST_F(SaveScreenTest, TheFieldHintsAtWhatToWrite)
{
    EXPECT_FALSE(open(history()).saveDescription().placeholderText().isEmpty());
    EXPECT_EQ(screen->saveDescription().text(), "");
}

TEST_F(SaveScreenTest, SaveWritesTheTimeOfOpeningTheHistoryAndTheDescription)
{
    open(history());
    fake.clock.advance(75s);
    type("On the road");
    press(screen->saveButton());
    EXPECT_THAT(files(), ElementsAre("VentrikSnapshot-1794809503.ventrik"));
    EXPECT_EQ(saved("VentrikSnapshot-1794809503.ventrik"),
              (PlistDictionary{{"Timestamp", "2026-11-16 06:10:28 +0000"},
                               {"Data", history()},
                               {"Description", "On the road"}}));
}

TEST_F(SaveScreenTest, TheApplicationIsToldWhereTheFileIs)
{
    open(history());
    press(screen->saveButton());
    EXPECT_THAT(savedFiles, ElementsAre(directory + "/VentrikSnapshot-1794809428.ventrik"));
}

TEST_F(SaveScreenTest, OfAFailedWriteTheApplicationIsToldNoFile)
{
    std::ofstream(directory) << "a file where the directory should be";
    open(history());
    press(screen->saveButton());
    EXPECT_THAT(savedFiles, IsEmpty());
}

TEST_F(SaveScreenTest, AnEmptyDescriptionIsWrittenEmpty)
{
    open(history());
    press(screen->saveButton());
    EXPECT_EQ(*saved().find("Description"), PlistValue(""));
}

TEST_F(SaveScreenTest, WithoutAGeneratorTheFileHoldsTheTimeAlone)
{
    open(std::nullopt);
    EXPECT_THAT(screen->saveContentTable().visibleRows(), IsEmpty());
    press(screen->saveButton());
    EXPECT_EQ(saved(), (PlistDictionary{{"Timestamp", "2026-11-16 06:10:28 +0000"}}));
}

TEST_F(SaveScreenTest, TwoSavesWithinASecondWriteOneFile)
{
    open(history());
    type("first");
    press(screen->saveButton());
    fake.clock.advance(999ms);
    open(history());
    type("second");
    press(screen->saveButton());
    EXPECT_THAT(files(), ElementsAre("VentrikSnapshot-1794809428.ventrik"));
    EXPECT_EQ(*saved().find("Description"), PlistValue("second"));
}

TEST_F(SaveScreenTest, WhatChangesAfterTheOpeningIsNotInTheFile)
{
    PlistArray contents = history();
    PlistDictionary cell{{"RSRP", "-94 dBm"}};
    contents.append(PlistDictionary{{"Display", PlistDictionary{{"Cell", cell}}}});
    open(contents);
    contents.append(entry("later"));
    cell.set("RSRP", "-70 dBm");
    press(screen->saveButton());
    PlistArray expected = history();
    expected.append(PlistDictionary{
        {"Display", PlistDictionary{{"Cell", PlistDictionary{{"RSRP", "-94 dBm"}}}}}});
    EXPECT_EQ(*saved().find("Data"), PlistValue(expected));
}

TEST_F(SaveScreenTest, TheDirectoryIsMadeAtTheFirstSave)
{
    open(history());
    EXPECT_FALSE(std::filesystem::exists(directory));
    press(screen->saveButton());
    EXPECT_TRUE(std::filesystem::is_directory(directory));
}

TEST_F(SaveScreenTest, SaveClosesThroughTheMainQueue)
{
    open(history());
    press(screen->saveButton());
    EXPECT_EQ(closings, 0);
    fake.mainQueue.run();
    EXPECT_EQ(closings, 1);
}

TEST_F(SaveScreenTest, CancelClosesThroughTheMainQueueAndWritesNothing)
{
    open(history());
    press(screen->cancelButton());
    EXPECT_EQ(closings, 0);
    fake.mainQueue.run();
    EXPECT_EQ(closings, 1);
    EXPECT_THAT(files(), IsEmpty());
}

TEST_F(SaveScreenTest, EscapeCancels)
{
    open(history());
    type("half a sent");
    QTest::keyClick(&screen->saveDescription(), Qt::Key_Escape);
    fake.mainQueue.run();
    EXPECT_EQ(closings, 1);
    EXPECT_THAT(files(), IsEmpty());
}

TEST_F(SaveScreenTest, AScreenThatIsGoneClosesNothing)
{
    open(history());
    press(screen->cancelButton());
    screen.reset();
    fake.mainQueue.run();
    EXPECT_EQ(closings, 0);
}

TEST_F(SaveScreenTest, AFailedWriteIsLoggedAndShownAndTheScreenClosesAllTheSame)
{
    std::ofstream(directory) << "a file where the directory should be";
    open(history());
    fake.log.clear();
    press(screen->saveButton());
    const std::string file = directory + "/VentrikSnapshot-1794809428.ventrik";
    EXPECT_THAT(fake.log.texts(LogPriority::error),
                ElementsAre("Snapshot not written: " + file + ": Not a directory",
                            "Unable to write snapshot to " + file));
    ASSERT_NE(alert(), nullptr);
    EXPECT_TRUE(alert()->isVisible());
    EXPECT_EQ(alert()->windowTitle(), "File Error");
    EXPECT_EQ(alert()->text(), "Unable to write file to disk");
    EXPECT_EQ(alert()->informativeText(), "");
    ASSERT_EQ(alert()->buttons().size(), 1);
    EXPECT_EQ(alert()->buttons().front()->text(), "Close");
    fake.mainQueue.run();
    EXPECT_EQ(closings, 1);
}

TEST_F(SaveScreenTest, TheAlertOutlivesTheScreenAndGoesByItsButton)
{
    std::ofstream(directory) << "a file where the directory should be";
    open(history());
    press(screen->saveButton());
    stack.dismiss(false);
    screen.reset();
    ASSERT_NE(alert(), nullptr);
    QTest::mouseClick(alert()->buttons().front(), Qt::LeftButton);
    deletePopped();
    EXPECT_EQ(alert(), nullptr);
}

TEST_F(SaveScreenTest, ASuccessfulSaveShowsNoAlertAndLogsNothing)
{
    open(history());
    press(screen->saveButton());
    EXPECT_EQ(alert(), nullptr);
    EXPECT_THAT(fake.log.texts(LogPriority::error), IsEmpty());
}

TEST_F(SaveScreenTest, EnterHidesTheKeyboardAndKeepsTheText)
{
    open(history());
    type("drive");
    ASSERT_TRUE(fieldHasFocus());
    QTest::keyClick(&screen->saveDescription(), Qt::Key_Return);
    EXPECT_FALSE(fieldHasFocus());
    EXPECT_EQ(screen->saveDescription().text(), "drive");
    EXPECT_EQ(closings, 0);
    EXPECT_TRUE(screen->textFieldShouldReturn(screen->saveDescription()));
}

TEST_F(SaveScreenTest, WhatIsTypedAtOnceIsTheDescription)
{
    open(history());
    QTest::keyClicks(QApplication::focusWidget(), "drive");
    EXPECT_EQ(screen->saveDescription().text(), "drive");
}

TEST_F(SaveScreenTest, TheTabKeyWalksDescriptionTableCancelAndSave)
{
    open(history());
    const std::vector<QWidget*> way{&screen->saveContentTable(), &screen->cancelButton(),
                                    &screen->saveButton(), &screen->saveDescription()};
    ASSERT_TRUE(fieldHasFocus());
    for (QWidget* next : way) {
        const QImage without = next->grab().toImage();
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
        ASSERT_EQ(QApplication::focusWidget(), next);
        EXPECT_NE(next->grab().toImage(), without);
    }
}

TEST_F(SaveScreenTest, EnterInTheDescriptionSaves)
{
    open(history());
    type("drive");
    QTest::keyClick(&screen->saveDescription(), Qt::Key_Return);
    EXPECT_EQ(*saved().find("Description"), PlistValue("drive"));
    fake.mainQueue.run();
    EXPECT_EQ(closings, 1);
}

TEST_F(SaveScreenTest, ControlEnterSavesWhereverTheKeyboardIs)
{
    for (const Qt::Key key : {Qt::Key_Return, Qt::Key_Enter})
        for (const bool isOnTable : {true, false}) {
            open(history());
            if (isOnTable)
                screen->saveContentTable().setFocus();
            QTest::keyClick(QApplication::focusWidget(), key, Qt::ControlModifier);
            fake.mainQueue.run();
            EXPECT_EQ(std::exchange(closings, 0), 1) << key << isOnTable;
        }
}

TEST_F(SaveScreenTest, EscapeClosesTheAlertWhereverTheKeyboardIs)
{
    std::ofstream(directory) << "a file where the directory should be";
    open(history());
    press(screen->saveButton());
    ASSERT_NE(alert(), nullptr);
    QTest::keyClick(&stack.topScreen(), Qt::Key_Escape);
    deletePopped();
    EXPECT_EQ(alert(), nullptr);
}

TEST_F(SaveScreenTest, TheAlertDrawsItsTitleItselfWithoutAWindowFrame)
{
    std::ofstream(directory) << "a file where the directory should be";
    open(history());
    press(screen->saveButton());
    ASSERT_NE(alert(), nullptr);
    EXPECT_TRUE(alert()->windowFlags().testFlag(Qt::FramelessWindowHint));
    const QImage titled = alert()->grab().toImage();
    alert()->setWindowTitle("");
    EXPECT_NE(alert()->grab().toImage(), titled);
}

TEST_F(SaveScreenTest, TheSecondClickOnWhatOpenedItLeavesTheKeyboard)
{
    open(history());
    QMouseEvent second(QEvent::MouseButtonDblClick, {300, 760},
                       screen->mapToGlobal(QPointF(300, 760)), Qt::LeftButton, Qt::LeftButton,
                       Qt::NoModifier);
    QCoreApplication::sendEvent(screen.get(), &second);
    EXPECT_TRUE(fieldHasFocus());
}

TEST_F(SaveScreenTest, FitsIntoANarrowWindow)
{
    open(history());
    for (const int width : {200, 320}) {
        showAt(stack, width, 480);
        EXPECT_EQ(stack.width(), width);
        EXPECT_LE(screen->saveButton().geometry().right(), width - 12);
        EXPECT_GT(screen->saveButton().width(), 40);
        EXPECT_LT(screen->cancelButton().geometry().right(), screen->saveButton().x());
    }
}

TEST_F(SaveScreenTest, ARowsTextGivesWayToItsCheckMark)
{
    open(history());
    EXPECT_EQ(row(0).textLabel().toolTip(), "");
    showAt(stack, 200, 480);
    EXPECT_EQ(row(0).textLabel().toolTip(), "Snapshot (2026-11-16 06:10:26 +0000)");
}

TEST_F(SaveScreenTest, AnEmptyTableSaysWhy)
{
    EXPECT_NE(open(PlistArray()).saveContentTable().placeholder(), "");
}

TEST_F(SaveScreenTest, ATouchOnTheBackgroundHidesTheKeyboard)
{
    open(history());
    type("drive");
    QTest::mouseClick(screen.get(), Qt::LeftButton, {}, {200, 700});
    EXPECT_FALSE(fieldHasFocus());
}

TEST_F(SaveScreenTest, ATouchOnARowHidesTheKeyboardAndLeavesTheRowAsItIs)
{
    open(history());
    type("drive");
    QTest::mouseClick(&row(1), Qt::LeftButton, {}, {60, 25});
    EXPECT_FALSE(fieldHasFocus());
    EXPECT_EQ(row(1).accessory(), TableRowAccessory::CheckMark);
    EXPECT_EQ(screen->saveContentTable().indexPathForSelectedRow(), (IndexPath{0, 1}));
}

TEST_F(SaveScreenTest, TheTabKeyStaysOnTheScreen)
{
    open(history());
    screen->saveDescription().setFocus();
    for (int i = 0; i < 6; ++i) {
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
        ASSERT_TRUE(screen->isAncestorOf(QApplication::focusWidget()) ||
                    QApplication::focusWidget() == screen.get());
    }
}

TEST_F(SaveScreenTest, WhatIsPastedAndCannotBeWrittenBecomesSpaces)
{
    open(history());
    saveDescriptionByPaste(QString("a\tb\nc") + QChar(1) + QChar(0xFFFF) +
                           QString::fromUtf8("\xF0\x9F\x93\xA1"));
    press(screen->saveButton());
    EXPECT_EQ(alert(), nullptr);
    EXPECT_EQ(*saved().find("Description"), PlistValue("a b c  \xF0\x9F\x93\xA1"));
}

} // namespace ventrik
