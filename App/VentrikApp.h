#pragma once

#include "App/AlertTeller.h"
#include "App/CaptureReading.h"
#include "App/DateFormatter.h"
#include "App/TimeLine.h"
#include "App/TimeLineScreen.h"
#include "App/TimeLineView.h"
#include "App/Toolkit/NavigationStack.h"
#include "App/VentrikPaneController.h"
#include "App/VentrikSaveViewController.h"
#include "App/ViewerWindow.h"
#include "Charts/QualityBands.h"
#include "Model/ChannelPane.h"
#include "Model/ValueSource.h"
#include "Platform/Notices.h"
#include "Platform/Platform.h"

#include <QPointer>
#include <QShortcut>
#include <QSize>
#include <QWidget>

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

struct VentrikAppOptions {
    bool saveButton = false; ///< offers Save also where the marker path is missing
    /// Where anything stands at this path, Save is offered.
    std::string saveButtonMarker =
        "/NorvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle";
    std::string snapshotDirectory; ///< where Save writes
    bool animation = true;
    bool tintsChanges = true;                 ///< tints values that have changed for a moment
    RecordsMode records = RecordsMode::Newer; ///< by which layouts records are read
    bool channelPane = false;                 ///< the root ends with a row for the channel
    std::optional<QSize> windowSize;          ///< none: as large as the main screen
    ChangeStore::Limits historyLimits;        ///< of what the time line keeps
    bool timeLine = true; ///< stands beside the panes from the start, unless it was hidden before
    bool timeLineButton = false; ///< where it does not stand there, a button leads to it
    QualityBands bands;          ///< by which signals are excellent, good, fair or poor
    std::vector<ValueAlert> alerts;
    Notices* notices = nullptr; ///< tells of alerts; none where it is null
    std::function<void()> ring; ///< the bell, for alerts; may be none
    /// Shown in the place of what a telephony service tells; null as a rule.
    std::shared_ptr<OpenedSource> opened;
};

/// The application: builds the window, the model and the root pane, brings the screens up to
/// date after each refresh, and undoes its one system setting at the end. Everything runs on the
/// main queue; a QApplication exists for as long as this does.
class VentrikApp : public NavigationStackDelegate, public VentrikPaneHost, public VentrikSaveHost
{
  public:
    VentrikApp(const Platform& platform, VentrikAppOptions options);
    ~VentrikApp() override;
    VentrikApp(const VentrikApp&) = delete;
    VentrikApp& operator=(const VentrikApp&) = delete;

    void getSaveButtonPref();
    void applicationDidFinishLaunching();
    /// May come more than once, and also where there was no launch.
    void applicationWillTerminate();
    /// Writes whether the home screen shows the signal level as a number.
    void _setGSMRSSI(bool value);

    /// Opens the channel's pane; where that shows, goes back to the root.
    void toggleChannelPane();
    /// Shows the present, or what stood at some moment; messages are taken all the while.
    TimeLine& timeLine() { return _timeLine; }
    /// Shows the time line beside the panes or hides it there; in a narrow window opens its screen,
    /// or leaves that.
    void toggleTimeLine() override;
    bool offersTimeLine() const override;
    /// Null before launch and after termination.
    TimeLineView* timeLineView() const { return _timeLineView; }

    void showSaveView() override;
    void closeSaveView() override;
    /// The status line tells for some seconds where the file is.
    void snapshotSaved(const std::string& fileName) override;

    void updateStatusForViewController(Screen& screen);
    void updateViewControllerFromModel();
    void willShowScreen(NavigationStack& stack, Screen& screen, bool animated) override;

    /// Null before launch and after termination, as is the stack, which belongs to the window.
    QWidget* window() const { return _window.get(); }
    /// What was shown in the former window goes with it, but for the save screen, which stays open
    /// without one.
    void setWindow(std::unique_ptr<QWidget> window);
    NavigationStack* navController() const { return _navController; }

    /// The save screen while it is open, else null.
    VentrikSaveViewController* saveViewController() const { return _saveViewController.get(); }
    void setSaveViewController(std::unique_ptr<VentrikSaveViewController> screen)
    {
        _saveViewController = std::move(screen);
    }
    /// Null before launch and after termination.
    const DateFormatter* dateFormatter() const { return _dateFormatter.get(); }
    const std::optional<std::string>& updateMessage() const { return _updateMessage; }
    void setUpdateMessage(std::optional<std::string> message)
    {
        _updateMessage = std::move(message);
    }
    /// Null also before launch and after termination.
    ModelNodePointer topLevelNodes() override;
    ModelNodePointer nodeAtPath(const std::string& path) override;
    std::string_view doubtAt(const std::string& path) const override;
    std::vector<std::string> layoutWarningsAt(const std::string& path) const override;
    bool allowSaveButton() const override { return _allowSaveButton && !_reading; }
    bool tintsChanges() const override
    {
        return _options.tintsChanges && !showsPast() && !_isMovingInTime;
    }
    bool showsPast() const override { return _timeLine.isPaused(); }
    void goLive() override;
    bool canPin(const std::string& path) override { return _timeLine.canPin(path); }
    bool isPinned(const std::string& path) const override { return _timeLine.isPinned(path); }
    void togglePin(const std::string& path) override;
    bool isStale(const std::string& path) override;
    std::string briefSourceOf(const std::string& path) override;
    void showSourceOf(const std::string& path) override;
    StatusNote statusNote() const override;
    std::string reasonForNoData() const override;
    void setAllowSaveButton(bool allow) { _allowSaveButton = allow; }

  private:
    void createWindow();
    void createDateFormatter();
    void createNavigationStack();
    void showWindow();
    void startModelLater();
    void channelChanged();
    void updateTopNotes();
    std::string topPath() const;
    void updateChannelPane();
    void updateWindowTitle();
    void reloadScreens();
    void createTimeLine();
    void shownMomentChanged();
    void updateTimeLine();
    void leaveTimeLineScreen();
    void openPane(const std::string& path);
    void togglePause();
    std::string pausedStatus() const;
    std::string presentStatus() const;
    std::string timeLineStatus() const;
    void openCapture();
    std::string_view technologyName() const;
    DisplayTree* shownTree() const;

    Platform _platform;
    VentrikAppOptions _options;

    std::unique_ptr<QWidget> _window;
    QPointer<ViewerWindow> _viewerWindow; // while the window is one of ours
    QPointer<NavigationStack> _navController;
    std::unique_ptr<VentrikSaveViewController> _saveViewController;
    ChannelCounts _channelCounts;
    ChangeStore _store;
    TimeLine _timeLine;
    AlertTeller _alertTeller{_platform.clock, _options.notices, _options.ring};
    ValueSources _sources;
    std::unique_ptr<DateFormatter> _pauseFormatter;
    QPointer<TimeLineView> _timeLineView;     // the window's
    QPointer<TimeLineScreen> _timeLineScreen; // while the stack has one
    std::optional<CaptureReading> _reading;   // of an opened capture
    QPointer<QShortcut> _liveKey;             // Home, while that leads anywhere
    std::shared_ptr<VentrikModel> _model;
    std::unique_ptr<ChannelPane> _tree; // the model's, with a row for the channel
    bool _allowSaveButton = false;
    std::unique_ptr<DateFormatter> _dateFormatter;
    std::optional<std::string> _updateMessage;
    bool _hasRefreshed = false;
    bool _isMovingInTime = false; // what shows changes, but did not change just now
    std::optional<Clock::TimePoint> _lastUpdate;
    std::shared_ptr<const std::string> _savedMessage; // while it is shown
    std::unique_ptr<RepeatingTimer> _noteTimer;
    std::unique_ptr<RepeatingTimer> _channelTimer;
};

} // namespace ventrik
