#include "App/VentrikApp.h"

#include "App/OriginScreen.h"
#include "App/Strip/SignalStrip.h"
#include "App/Toolkit/PlainText.h"
#include "Model/ChannelNote.h"
#include "Model/NodeRows.h"
#include "Model/SeriesPoint.h"
#include "Platform/Technology.h"

#include <QGuiApplication>
#include <QScreen>

#include <algorithm>
#include <filesystem>
#include <iterator>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

constexpr std::string_view homeScreenDomain = "org.ventrik.HomeScreen";
constexpr std::string_view showGSMRSSIKey = "HSShowGSMRSSI";

constexpr auto noteInterval = 1s;
constexpr auto channelInterval = 2s;
constexpr auto savedMessageTime = 8s;

constexpr std::string_view timeLineKey = "TimeLine";
constexpr std::string_view timeLineShown = "shown";
constexpr std::string_view timeLineHidden = "hidden";

constexpr const char* firstStatus = "Connecting";
constexpr const char* connectingStatus = "Connecting...";

bool exists(const std::string& path)
{
    std::error_code error;
    return std::filesystem::exists(path, error);
}

} // namespace

VentrikApp::VentrikApp(const Platform& platform, VentrikAppOptions options)
    : _platform(platform),
      _options(std::move(options)),
      _channelCounts(_options.records),
      _store(_options.records, _options.historyLimits),
      _timeLine(_store, platform.preferences, _options.opened ? nullptr : &platform.clock,
                _options.alerts),
      _sources(platform.resources, platform.clock, _options.records)
{
    if (_options.opened)
        _reading.emplace(_options.opened, _platform, _store, _timeLine);
}

VentrikApp::~VentrikApp() = default;

void VentrikApp::getSaveButtonPref()
{
    setAllowSaveButton(_options.saveButton || exists(_options.saveButtonMarker));
}

void VentrikApp::applicationDidFinishLaunching()
{
    getSaveButtonPref();
    createWindow();
    _model = std::make_shared<VentrikModel>(
        _platform, [this] { updateViewControllerFromModel(); },
        LogGenerator::generatorsReading(_options.records));
    _model->addObserver(_channelCounts);
    _model->addObserver(_store);
    _model->setChannelCallback([this] { channelChanged(); });
    _tree = std::make_unique<ChannelPane>(*_model, _channelCounts, _platform.clock);
    _timeLine.setCallback([this] { shownMomentChanged(); });
    setUpdateMessage(connectingStatus);
    createDateFormatter();
    createNavigationStack();
    showWindow();
    _noteTimer = _platform.mainQueue.repeatEvery(noteInterval, [this] {
        updateTopNotes();
        if (!showsPast())
            updateTimeLine(); // ages and times go on while nothing comes
    });
    _channelTimer =
        _platform.mainQueue.repeatEvery(channelInterval, [this] { updateChannelPane(); });
    if (_options.channelPane) {
        _tree->keep();
        reloadScreens();
    }
    if (_reading)
        openCapture();
    else
        startModelLater();
}

void VentrikApp::openCapture()
{
    _hasRefreshed = true;
    _reading->start([this] {
        updateTimeLine();
        updateStatusForViewController(_navController->topScreen());
        updateWindowTitle();
    });
    updateStatusForViewController(_navController->topScreen());
    updateWindowTitle();
}

void VentrikApp::createWindow()
{
    auto window = std::make_unique<ViewerWindow>();
    _viewerWindow = window.get();
    setWindow(std::move(window));
    _window->setWindowTitle(QStringLiteral("Ventrik"));
    // The texts and the names on the air are written that way, whatever the desktop's language is.
    _window->setLayoutDirection(Qt::LeftToRight);
    if (_options.windowSize)
        _window->resize(*_options.windowSize);
    else
        _window->setGeometry(QGuiApplication::primaryScreen()->geometry());
}

// The application owns the save screen, the window must not delete it.
void VentrikApp::setWindow(std::unique_ptr<QWidget> window)
{
    if (_navController)
        _navController->dismiss(false);
    _window = std::move(window);
}

void VentrikApp::createDateFormatter()
{
    _dateFormatter = std::make_unique<DateFormatter>(_platform.clock);
    _dateFormatter->setDateFormat(QStringLiteral("'Updated' yyyy-MM-dd 'at' HH:mm:ss"));
    _pauseFormatter = std::make_unique<DateFormatter>(_platform.clock);
    _pauseFormatter->setDateFormat(_reading ? QStringLiteral("'at' yyyy-MM-dd HH:mm:ss")
                                            : QStringLiteral("'Paused at' HH:mm:ss"));
}

void VentrikApp::createNavigationStack()
{
    auto root = VentrikPaneController::initWithNode(*this, nullptr, "/");
    root->setStatus(firstStatus, true);
    _navController = new NavigationStack(std::move(root), _window.get());
    _navController->setAnimationEnabled(_options.animation);
    _navController->setDelegate(this);
}

void VentrikApp::showWindow()
{
    _viewerWindow->addPanes(_navController);
    createTimeLine();
    auto* channelKey = new QShortcut(QKeySequence(Qt::Key_F8), _window.get());
    QObject::connect(channelKey, &QShortcut::activated, _window.get(),
                     [this] { toggleChannelPane(); });
    _liveKey = new QShortcut(QKeySequence(Qt::Key_Home), _window.get());
    _liveKey->setEnabled(false);
    QObject::connect(_liveKey, &QShortcut::activated, _window.get(), [this] { goLive(); });
    _window->show();
    _window->activateWindow();
}

void VentrikApp::createTimeLine()
{
    _timeLineView = new TimeLineView(_timeLine, _platform.clock);
    _timeLineView->setListener(
        {.onLive = [this] { goLive(); },
         .onOpen = [this](const std::string& path) { openPane(path); },
         .onPause = [this] { togglePause(); },
         .onSaved = [this](const std::string& fileName) { snapshotSaved(fileName); }});
    if (_reading)
        _timeLineView->setCaptureName(_reading->name());
    _viewerWindow->addTimeLine(_timeLineView);
    const auto kept = _platform.preferences.text(preferenceDomain, timeLineKey);
    _viewerWindow->setTimeLineWanted(_options.timeLine && kept != timeLineHidden);
    _timeLineView->strip().setBands(_options.bands);
    _viewerWindow->setWidthCallback([this] {
        leaveTimeLineScreen();
        updateTimeLine();
        if (_navController && _options.timeLineButton)
            updateStatusForViewController(_navController->topScreen());
    });
    _viewerWindow->setSpaceCallback([this] {
        if (!_saveViewController)
            togglePause();
    });
    auto* key = new QShortcut(QKeySequence(Qt::CTRL | Qt::Key_T), _window.get());
    QObject::connect(key, &QShortcut::activated, _window.get(), [this] { toggleTimeLine(); });
    updateTimeLine();
}

bool VentrikApp::offersTimeLine() const
{
    return _options.timeLineButton && _viewerWindow && !_viewerWindow->isWide();
}

void VentrikApp::toggleTimeLine()
{
    if (!_navController || _saveViewController)
        return;
    if (_viewerWindow->isWide()) {
        const bool isWanted = !_viewerWindow->isTimeLineWanted();
        _viewerWindow->setTimeLineWanted(isWanted);
        _platform.preferences.setText(preferenceDomain, timeLineKey,
                                      isWanted ? timeLineShown : timeLineHidden);
        _platform.preferences.synchronize(preferenceDomain);
        updateTimeLine();
    } else if (_timeLineScreen && &_navController->topScreen() == _timeLineScreen) {
        leaveTimeLineScreen();
    } else {
        leaveTimeLineScreen(); // where a pane was opened from it, which then lies on top
        auto screen = std::make_unique<TimeLineScreen>(*this, *_viewerWindow, *_timeLineView);
        _timeLineScreen = screen.get();
        _navController->push(std::move(screen), true);
        updateTimeLine();
    }
}

// The end of a capture stands still by itself.
void VentrikApp::togglePause()
{
    if (_reading)
        goLive();
    else
        _timeLine.togglePause();
}

// With the panes on the way there below it, so that the way back is the usual one.
void VentrikApp::openPane(const std::string& path)
{
    if (!_navController || _saveViewController)
        return;
    leaveTimeLineScreen();
    _navController->popTo(*_navController->screens().front(), false);
    ModelNodePointer node = topLevelNodes();
    for (std::string way = "/"; node;) {
        const auto leadsThere = [&](const ModelNodePointer& child) {
            const std::string step = pathJoining(way, child->displayName());
            return child->childNodes() && (path == step || path.starts_with(step + "/"));
        };
        const VentrikModelNode::Children& children = rowsOf(node);
        const auto next = std::ranges::find_if(children, leadsThere);
        if (next == children.end())
            break;
        way = pathJoining(way, (*next)->displayName());
        _navController->push(VentrikPaneController::initWithNode(*this, *next, way), false);
        node = ModelNodePointer(*next);
    }
}

void VentrikApp::togglePin(const std::string& path)
{
    _timeLine.togglePin(path);
    updateTimeLine();
}

// What no record told is told by nobody again.
bool VentrikApp::isStale(const std::string& path)
{
    if (_store.isEmpty())
        return false;
    const DisplayMoment::Value* value = _timeLine.shown().valueAt(path);
    const Clock::TimePoint now = _timeLine.pausedAt().value_or(_timeLine.end());
    return value && value->logCode != 0 && now - value->written > longestHold;
}

std::string VentrikApp::briefSourceOf(const std::string& path)
{
    const auto source =
        _store.isEmpty() ? std::nullopt : _sources.find(_timeLine.shown(), _store, path);
    return source ? source->brief() : std::string();
}

void VentrikApp::showSourceOf(const std::string& path)
{
    if (!_navController)
        return;
    _navController->push(
        std::make_unique<OriginScreen>(*this, _platform.clock,
                                       [this, path]() -> std::optional<ValueSource> {
                                           if (_store.isEmpty())
                                               return std::nullopt;
                                           return _sources.find(_timeLine.shown(), _store, path);
                                       }),
        true);
}

void VentrikApp::leaveTimeLineScreen()
{
    if (!_timeLineScreen || !_navController)
        return;
    const std::vector<Screen*> screens = _navController->screens();
    const auto screen = std::ranges::find(screens, _timeLineScreen.data());
    _timeLineScreen = nullptr;
    if (screen != screens.end() && screen != screens.begin())
        _navController->popTo(**std::prev(screen), false);
}

void VentrikApp::updateTimeLine()
{
    if (!_timeLineView || _timeLineView->isHidden())
        return;
    _timeLineView->setStatus(QString::fromStdString(timeLineStatus()), showsPast(),
                             _reading ? QStringLiteral("End") : QStringLiteral("Live"));
    _timeLineView->update();
}

std::string VentrikApp::timeLineStatus() const
{
    if (const auto at = _timeLine.pausedAt())
        return _pauseFormatter->stringFromDate(*at);
    if (_reading)
        return _reading->status();
    return presentStatus();
}

// Not before the launch has returned; by then the application may have ended again.
void VentrikApp::startModelLater()
{
    _platform.mainQueue.async([started = std::weak_ptr(_model)] {
        if (const auto model = started.lock())
            model->restartMonitor();
    });
}

void VentrikApp::applicationWillTerminate()
{
    _setGSMRSSI(false);
    _noteTimer.reset();
    _channelTimer.reset();
    _savedMessage.reset();
    setUpdateMessage(std::nullopt);
    _timeLine.setCallback({});
    _timeLine.goLive();
    _dateFormatter.reset();
    _pauseFormatter.reset();
    _reading.reset();
    setSaveViewController(nullptr);
    if (_window)
        _window->hide();
    setWindow(nullptr);
    _tree.reset();
    _model.reset();
}

void VentrikApp::_setGSMRSSI(bool value)
{
    _platform.preferences.set(homeScreenDomain, showGSMRSSIKey, value);
    _platform.preferences.synchronize(homeScreenDomain);
    _platform.preferences.postChanged(homeScreenDomain, showGSMRSSIKey);
}

void VentrikApp::showSaveView()
{
    if (_saveViewController || !_navController || _reading)
        return;
    setSaveViewController(VentrikSaveViewController::initWithSaveHistory(
        *this, _platform, _options.snapshotDirectory, _model->getSaveContents()));
    _navController->present(*_saveViewController, true);
}

void VentrikApp::closeSaveView()
{
    if (!_saveViewController)
        return;
    if (_navController)
        _navController->dismiss(true);
    setSaveViewController(nullptr);
}

void VentrikApp::snapshotSaved(const std::string& fileName)
{
    _savedMessage = std::make_shared<const std::string>("Saved to " + fileName);
    updateTopNotes();
    _platform.mainQueue.after(savedMessageTime, [this, shown = std::weak_ptr(_savedMessage)] {
        if (shown.expired())
            return; // the application is gone, or tells of another file
        _savedMessage.reset();
        updateTopNotes();
    });
}

void VentrikApp::updateStatusForViewController(Screen& screen)
{
    if (_reading)
        screen.setStatus(_reading->status(), _reading->isReading());
    else if (showsPast())
        screen.setStatus(pausedStatus(), false);
    else if (_model->isConnected())
        screen.setStatus(_updateMessage.value_or(std::string()), false);
    else
        screen.setStatus(connectingStatus, true);
}

// A capture's present is its end.
void VentrikApp::goLive()
{
    if (_reading)
        _reading->showEnd();
    else
        _timeLine.goLive();
}

// Behind the moment stands what it leads back to.
std::string VentrikApp::pausedStatus() const
{
    return _pauseFormatter->stringFromDate(*_timeLine.pausedAt()) + " · " + presentStatus();
}

std::string VentrikApp::presentStatus() const
{
    return _model && _model->isConnected() ? "Live" : connectingStatus;
}

// From the bottom up to the first screen above the root that has nothing left to show.
void VentrikApp::reloadScreens()
{
    const std::vector<Screen*> screens = _navController->screens();
    screens.front()->reload();
    const auto gone = std::find_if_not(screens.begin() + 1, screens.end(),
                                       [](Screen* screen) { return screen->reload(); });
    if (gone != screens.end())
        _navController->popTo(**std::prev(gone), true);
}

void VentrikApp::updateViewControllerFromModel()
{
    if (!_navController)
        return;
    _hasRefreshed = true;
    _tree->takeDisplay(); // which records it in the history, whatever is shown
    _alertTeller.tell(_timeLine.update());
    updateTimeLine();
    if (!showsPast())
        reloadScreens();
    if (_model->isConnected()) {
        _lastUpdate = _platform.clock.now();
        setUpdateMessage(_dateFormatter->stringFromDate(*_lastUpdate));
    }
    updateStatusForViewController(_navController->topScreen());
    updateWindowTitle();
}

void VentrikApp::shownMomentChanged()
{
    if (!_navController)
        return;
    _liveKey->setEnabled(showsPast());
    updateTimeLine();
    _isMovingInTime = true;
    reloadScreens();
    _isMovingInTime = false;
    updateStatusForViewController(_navController->topScreen());
}

// Until the first refresh the root pane keeps its first status.
void VentrikApp::channelChanged()
{
    if (!_navController)
        return;
    _store.channelChanged(_platform.clock.now(), _model->isConnected(),
                          channelFaultText(_model->channelFault()));
    if (_hasRefreshed)
        updateStatusForViewController(_navController->topScreen());
    else
        updateTopNotes();
    _alertTeller.tell(_timeLine.update());
    updateTimeLine();
    updateWindowTitle();
}

void VentrikApp::updateTopNotes()
{
    if (_navController)
        _navController->topScreen().updateNotes();
}

void VentrikApp::toggleChannelPane()
{
    if (!_navController || _saveViewController)
        return;
    if (_reading)
        return; // there is no channel
    _timeLine.goLive();
    const bool leadsThere = _tree->toggle(topPath());
    _navController->popTo(*_navController->screens().front(), false);
    reloadScreens();
    if (leadsThere) {
        auto pane = VentrikPaneController::initWithNode(
            *this, _tree->nodeAtPath(ChannelPane::rowPath), ChannelPane::rowPath);
        _navController->push(std::move(pane), true);
        updateStatusForViewController(_navController->topScreen());
    }
}

// Empty where the screen is no pane.
std::string VentrikApp::topPath() const
{
    const auto* pane = dynamic_cast<VentrikPaneController*>(&_navController->topScreen());
    return pane ? pane->path() : std::string();
}

// Also while nothing comes; then above all.
void VentrikApp::updateChannelPane()
{
    if (!_navController || showsPast() || !_tree->holds(topPath()))
        return;
    _tree->update();
    reloadScreens();
}

DisplayTree* VentrikApp::shownTree() const
{
    return showsPast() ? static_cast<DisplayTree*>(_timeLine.past()) : _tree.get();
}

ModelNodePointer VentrikApp::topLevelNodes()
{
    return shownTree() ? shownTree()->topLevelNodes() : nullptr;
}

ModelNodePointer VentrikApp::nodeAtPath(const std::string& path)
{
    // The channel has no past.
    if (_tree && _tree->holds(path))
        return _tree->nodeAtPath(path);
    return shownTree() ? shownTree()->nodeAtPath(path) : nullptr;
}

std::string_view VentrikApp::doubtAt(const std::string& path) const
{
    return shownTree() ? shownTree()->doubtAt(path) : std::string_view();
}

std::vector<std::string> VentrikApp::layoutWarningsAt(const std::string& path) const
{
    return shownTree() ? shownTree()->layoutWarningsAt(path) : std::vector<std::string>();
}

StatusNote VentrikApp::statusNote() const
{
    if (_savedMessage)
        return {*_savedMessage, StatusLabel::NoteKind::Passing};
    if (_reading)
        return {_reading->note()};
    return {_model ? channelNote(ChannelState::of(*_model), _platform.clock, _lastUpdate)
                   : std::string()};
}

std::string VentrikApp::reasonForNoData() const
{
    if (_reading && _store.isEmpty())
        return _reading->isReading() ? std::string() : "Nothing in the capture can be shown";
    if (showsPast())
        return "Nothing was here then";
    return _model ? ventrik::reasonForNoData(ChannelState::of(*_model)) : std::string();
}

void VentrikApp::updateWindowTitle()
{
    QString title = QStringLiteral("Ventrik");
    const auto add = [&title](const QString& part) {
        if (!part.isEmpty())
            title += QStringLiteral(" – ") + oneLine(part);
    };
    if (_reading)
        add(QString::fromStdString(_reading->name()));
    const std::string_view technology = technologyName();
    add(QString::fromUtf8(technology.data(), static_cast<qsizetype>(technology.size())));
    if (_navController->screens().size() > 1)
        add(_navController->topScreen().title());
    _window->setWindowTitle(title);
}

// As people call it; empty where it is not known.
std::string_view VentrikApp::technologyName() const
{
    if (!_reading)
        return _model->technologyName();
    const auto technology = technologyNamed(_store.technologyAt(_store.present()));
    return technology ? technology->displayName : std::string_view();
}

void VentrikApp::willShowScreen(NavigationStack&, Screen& screen, bool)
{
    updateStatusForViewController(screen);
    updateWindowTitle();
}

} // namespace ventrik
