#pragma once

#include "App/TimeLine.h"

#include <QWidget>

#include <functional>
#include <string>

class QLabel;
class QPushButton;

namespace ventrik
{

class SignalStrip;

/// What the time line's view tells its owner.
struct TimeLineListener {
    std::function<void()> onLive = {};  ///< back to the present
    std::function<void()> onPause = {}; ///< the present, or back to it
};

/// The time line: signals over time.
class TimeLineView : public QWidget
{
  public:
    /// All outlive it.
    TimeLineView(TimeLine& timeLine, const Clock& clock);

    void setListener(TimeLineListener listener);
    /// There are new data, or another moment is shown.
    void update();
    /// What the bar at the top says, and what leads back from a pause.
    void setStatus(const QString& text, bool isPaused, const QString& live);

    SignalStrip& strip() const { return *_strip; }

  private:
    QWidget* makeBar();
    void updateStrip();
    void showMenu();

    TimeLine& _timeLine;
    const Clock& _clock;
    TimeLineListener _listener;
    QLabel* _status;
    QPushButton* _pause;
    QPushButton* _menu;
    SignalStrip* _strip;
};

} // namespace ventrik
