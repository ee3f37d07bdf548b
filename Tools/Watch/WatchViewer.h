#pragma once

#include "Model/ChannelPane.h"
#include "Model/VentrikModel.h"
#include "Platform/Platform.h"
#include "Tools/Watch/CursesScreen.h"
#include "Tools/Watch/ScreenSignals.h"
#include "Tools/Watch/WatchPanes.h"

#include <functional>
#include <memory>
#include <optional>

#include <QSocketNotifier>

namespace ventrik
{

/// The viewer on a terminal: keys to panes, panes to the screen, on the main queue. It draws after
/// a refresh, a key, and where what is said of the channel has changed; a screen that looks as it
/// did is not drawn again.
class WatchViewer
{
  public:
    /// The model, its tree and what the platform refers to outlive this. `end` is called once, when
    /// the user quits or the terminal has gone; then come so many lines of standard error at most.
    /// Throws std::runtime_error where the terminal cannot show it.
    WatchViewer(const Platform& platform, VentrikModel& model, ChannelPane& tree,
                int mostErrorLines, std::function<void()> end);
    ~WatchViewer();
    WatchViewer(const WatchViewer&) = delete;
    WatchViewer& operator=(const WatchViewer&) = delete;

    /// The model has a new tree.
    void refresh();

  private:
    void readKeys();
    void toggleChannel();
    void updateChannel();
    void draw();
    WatchStatus status() const;

    Platform _platform;
    VentrikModel& _model;
    ChannelPane& _tree;
    int _seconds = 0;
    std::function<void()> _end;
    std::optional<Clock::TimePoint> _lastUpdate;
    bool _wasConnected = false;

    WatchPanes _panes;
    CursesScreen _screen;
    ScreenSignals _signals;
    QSocketNotifier _input;
    std::unique_ptr<RepeatingTimer> _ticks;
};

} // namespace ventrik
