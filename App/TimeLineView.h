#pragma once

#include "App/TimeLine.h"

#include <QWidget>

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

class QLabel;
class QPushButton;
class QTabBar;

namespace ventrik
{

class CellsView;
class EventsView;
class SignalStrip;
class TimeLineMenu;
struct StripData;

/// What the time line's view tells its owner.
struct TimeLineListener {
    std::function<void()> onLive = {};                        ///< back to the present
    std::function<void(const std::string& path)> onOpen = {}; ///< the pane there
    std::function<void()> onPause = {};                       ///< the present, or back to it
    std::function<void(const std::string& fileName)> onSaved = {};
};

/// The time line: signals over time, the cells of the moment that is shown side by side, and what
/// happened. Cells and events stand beside each other where there is room, else one at a time.
class TimeLineView : public QWidget
{
  public:
    static constexpr int widthForBothLists = 800;

    /// All outlive it.
    TimeLineView(TimeLine& timeLine, const Clock& clock);

    void setListener(TimeLineListener listener);
    /// As the files of values name it; "live" as long as nothing else is said.
    void setCaptureName(const std::string& name);
    /// There are new data, or another moment is shown.
    void update();
    /// What the bar at the top says, and what leads back from a pause.
    void setStatus(const QString& text, bool isPaused, const QString& live);

    SignalStrip& strip() const { return *_strip; }
    CellsView& cells() const { return *_cells; }
    EventsView& events() const { return *_events; }
    TimeLineMenu& menu() const { return *_menu; }

  protected:
    void resizeEvent(QResizeEvent* event) override;

  private:
    QWidget* makeBar();
    QWidget* makeLists();
    void layOutLists();
    void updateStrip();
    StripData stripData() const;

    TimeLine& _timeLine;
    const Clock& _clock;
    TimeLineListener _listener;
    QLabel* _status;
    QPushButton* _pause;
    QPushButton* _menuButton;
    std::vector<std::vector<SeriesPoint>> _points; // that the strip shows
    std::optional<std::uint64_t> _version;         // of what it shows
    Clock::TimePoint _end;
    SignalStrip* _strip;
    TimeLineMenu* _menu;
    CellsView* _cells;
    EventsView* _events;
    QTabBar* _tabs; // where the lists show one at a time
};

} // namespace ventrik
