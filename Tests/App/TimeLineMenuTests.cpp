#include "App/Strip/SignalStrip.h"
#include "App/TimeLineMenu.h"
#include "LogGenerator/Core/StateKeys.h"
#include "Packets/PacketBuilder.h"
#include "Tests/App/AppFixture.h"
#include "Tests/Support/IdleGenerator.h"

#include <QApplication>
#include <QFileDialog>
#include <QImage>
#include <QMessageBox>
#include <QPushButton>
#include <QTest>

#include <filesystem>
#include <fstream>
#include <iterator>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

/// A wide window with the values of one cell.
class TimeLineMenuTest : public AppFixture
{
  protected:
    TimeLineMenuTest()
    {
        window.applicationDidFinishLaunching();
        fake.mainQueue.run();
        EXPECT_TRUE(fake.ports.deliver(logChannelLocalPortName, 0,
                                       PacketBuilder(0xB0C2).u16(14, 301).size(38).build()));
        fake.mainQueue.advance(2s);
    }
    static VentrikAppOptions wide()
    {
        VentrikAppOptions options;
        options.animation = false;
        options.windowSize = QSize(900, 640);
        return options;
    }

    TimeLineMenu& menu() { return window.timeLineView()->menu(); }
    QPushButton& button()
    {
        for (QPushButton* button : window.timeLineView()->findChildren<QPushButton*>())
            if (button->text() == QStringLiteral("More"))
                return *button;
        throw std::logic_error("no button");
    }
    std::vector<std::string> entries()
    {
        std::vector<std::string> texts;
        for (const QAction* action : menu().actions())
            if (!action->isSeparator())
                texts.push_back(action->text().toStdString());
        return texts;
    }
    void choose(const char* entry)
    {
        for (QAction* action : menu().actions())
            if (action->text() == QString::fromUtf8(entry))
                return action->trigger();
        FAIL() << entry;
    }
    QMenu& pins()
    {
        for (QAction* action : menu().actions())
            if (action->menu()) {
                emit action->menu()->aboutToShow();
                return *action->menu();
            }
        throw std::logic_error("no menu of pins");
    }
    std::vector<std::string> lines()
    {
        std::vector<std::string> names;
        for (const auto& series : window.timeLine().series().series())
            names.push_back(series.pin.name);
        return names;
    }
    /// The dialog of an entry; null where there is none.
    QFileDialog* dialogOf(const char* entry)
    {
        choose(entry);
        return window.window()->findChild<QFileDialog*>();
    }
    std::string proposedBy(const char* entry)
    {
        QFileDialog* dialog = dialogOf(entry);
        return dialog->selectedFiles().value(0).toStdString();
    }
    /// As if that file had been chosen in the dialog.
    void save(const char* entry, const std::string& path)
    {
        QFileDialog* dialog = dialogOf(entry);
        ASSERT_NE(dialog, nullptr);
        dialog->selectFile(QString::fromStdString(path));
        QMetaObject::invokeMethod(dialog, "accept");
    }
    std::string pathOf(const char* name) const
    {
        return temporary.filePath(QString::fromUtf8(name)).toStdString();
    }
    static std::string textOf(const std::string& path)
    {
        std::ifstream file(path);
        return {std::istreambuf_iterator<char>(file), {}};
    }
    QMessageBox* sheet() { return window.window()->findChild<QMessageBox*>(); }
    std::string noteOfRoot()
    {
        return note(static_cast<VentrikPaneController&>(window.navController()->topScreen()));
    }

    VentrikApp window{fake.platform(), wide()};
};

} // namespace

TEST_F(TimeLineMenuTest, OpensByItsButtonAndIsWalkedByKeys)
{
    ASSERT_TRUE(QTest::qWaitForWindowActive(window.window()));
    button().setFocus();
    QTest::keyClick(&button(), Qt::Key_Space);
    ASSERT_EQ(QApplication::activePopupWidget(), &menu());
    EXPECT_EQ(menu().activeAction()->text(), "Save Picture…");
    QTest::keyClick(&menu(), Qt::Key_Up);
    EXPECT_EQ(menu().activeAction()->text(), "Keys");
    QTest::keyClick(&menu(), Qt::Key_Return);
    EXPECT_NE(sheet(), nullptr);
}

TEST_F(TimeLineMenuTest, OffersFilesTheWholeRangeAndTheKeys)
{
    EXPECT_THAT(entries(), ElementsAre("Save Picture…", "Save Drawing…", "Save Values…", "Show All",
                                       "Pinned", "Keys"));
}

TEST_F(TimeLineMenuTest, ProposesANameOfThePresentTime)
{
    EXPECT_THAT(proposedBy("Save Picture…"), EndsWith("/ventrik-2026-11-16-061028.png"));
}

TEST_F(TimeLineMenuTest, ProposesANameOfThePausesTime)
{
    window.timeLine().pause();
    fake.clock.advance(1h);
    EXPECT_THAT(proposedBy("Save Values…"), EndsWith("/ventrik-2026-11-16-061028.csv"));
}

TEST_F(TimeLineMenuTest, SavesAPicture)
{
    save("Save Picture…", pathOf("signals.png"));
    const QImage image(QString::fromStdString(pathOf("signals.png")));
    EXPECT_EQ(image.width(), window.timeLineView()->strip().width());
}

TEST_F(TimeLineMenuTest, WhatItSavesIsPrivate)
{
    save("Save Picture…", pathOf("strip.png"));
    EXPECT_EQ(QFile::permissions(QString::fromStdString(pathOf("strip.png"))) &
                  (QFile::ReadGroup | QFile::ReadOther | QFile::WriteOther),
              QFile::Permissions());
}

TEST_F(TimeLineMenuTest, SavesADrawing)
{
    save("Save Drawing…", pathOf("signals.svg"));
    EXPECT_THAT(textOf(pathOf("signals.svg")), HasSubstr("<svg "));
}

TEST_F(TimeLineMenuTest, SavesTheValuesOfTheShownRangeAsRows)
{
    save("Save Values…", pathOf("values.csv"));
    const std::string text = textOf(pathOf("values.csv"));
    EXPECT_THAT(text, StartsWith("capture,record,time,"));
    EXPECT_THAT(text, HasSubstr("\nlive,0,2026-11-16T"));
}

namespace
{

/// A capture of one value.
class OneValue : public OpenedSource
{
  public:
    void setObserver(MessageObserver& observer) override
    {
        observer.useGenerator(&_generator, "lte");
        _state.set(StateKey::display, PlistDictionary{{"PCI", "301"}});
        observer.messageTaken(Clock::TimePoint(60s), {}, _state);
    }
    std::string name() const override { return "drive.pcap"; }
    bool readOn() override { return false; }
    std::string progress() const override { return {}; }
    std::string fault() const override { return {}; }

  private:
    IdleGenerator _generator;
    PlistDictionary _state;
};

} // namespace

TEST_F(TimeLineMenuTest, NamesTheOpenedCaptureInItsRows)
{
    window.applicationWillTerminate();
    VentrikAppOptions options = wide();
    options.opened = std::make_shared<OneValue>();
    VentrikApp opened(fake.platform(), options);
    opened.applicationDidFinishLaunching();
    fake.mainQueue.run();
    opened.timeLineView()->menu().actions()[2]->trigger();
    auto* dialog = opened.window()->findChild<QFileDialog*>();
    ASSERT_NE(dialog, nullptr);
    dialog->selectFile(QString::fromStdString(pathOf("values.csv")));
    QMetaObject::invokeMethod(dialog, "accept");
    EXPECT_THAT(textOf(pathOf("values.csv")), HasSubstr("\ndrive.pcap,0,1970-01-01T00:01:00."));
}

TEST_F(TimeLineMenuTest, TellsOfAFileThatWasWrittenInTheStatusLine)
{
    save("Save Values…", pathOf("values.csv"));
    EXPECT_EQ(noteOfRoot(), "Saved to " + pathOf("values.csv"));
}

TEST_F(TimeLineMenuTest, AddsTheEndOfTheNameThatWasLeftOut)
{
    save("Save Drawing…", pathOf("signals"));
    EXPECT_TRUE(std::filesystem::exists(pathOf("signals.svg")));
}

TEST_F(TimeLineMenuTest, TellsOfAFileThatCannotBeWritten)
{
    save("Save Values…", "/dev/null/values.csv");
    ASSERT_NE(sheet(), nullptr);
    EXPECT_EQ(sheet()->windowTitle(), "File Error");
    EXPECT_THAT(sheet()->text().toStdString(), HasSubstr("/dev/null/values.csv"));
    EXPECT_EQ(noteOfRoot(), "");
}

TEST_F(TimeLineMenuTest, ShowsTheWholeRange)
{
    fake.clock.advance(1h);
    window.timeLineView()->update();
    SignalStrip& strip = window.timeLineView()->strip();
    EXPECT_EQ(strip.shownRange().second - strip.shownRange().first, 5min);
    choose("Show All");
    EXPECT_GE(strip.shownRange().second - strip.shownRange().first, 1h);
}

TEST_F(TimeLineMenuTest, ListsWhatIsPinned)
{
    QAction& first = *pins().actions().front();
    EXPECT_EQ(first.text(), "RSRP  /Serving Cell Measurements/Measured RSRP");
    EXPECT_TRUE(first.isChecked());
}

TEST_F(TimeLineMenuTest, UnpinsTheBestOfAListWhichNoRowShows)
{
    ASSERT_THAT(lines(), testing::Contains("Best neighbor RSRP"));
    for (QAction* action : pins().actions())
        if (action->text().startsWith("Best neighbor RSRP"))
            action->trigger();
    EXPECT_THAT(lines(), testing::Not(testing::Contains("Best neighbor RSRP")));
}

TEST_F(TimeLineMenuTest, PinsAgainWhatIsPinnedFromTheStart)
{
    const auto before = lines();
    pins().actions().front()->trigger();
    ASSERT_NE(lines(), before);
    pins().actions().back()->trigger();
    EXPECT_EQ(lines(), before);
}

TEST_F(TimeLineMenuTest, ListsTheKeys)
{
    choose("Keys");
    ASSERT_NE(sheet(), nullptr);
    EXPECT_EQ(sheet()->windowTitle(), "Keys");
    for (const char* key : {"Space", "Home", "Ctrl+T", ">P<", "Ctrl+I", "Left, Right", "+, -",
                            ">F<", ">X<", "Escape"})
        EXPECT_THAT(sheet()->text().toStdString(), HasSubstr(key));
    QTest::keyClick(sheet(), Qt::Key_Escape);
    EXPECT_FALSE(sheet() && sheet()->isVisible());
}

} // namespace ventrik
