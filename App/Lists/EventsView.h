#pragma once

#include "Model/EventLog.h"

#include <QWidget>

#include <functional>
#include <optional>

class QListView;

namespace ventrik
{

class EventsModel;

/// What happened, the newest on top. A click or Enter calls back with the event. What one reads
/// further down stays in its place when new events come.
class EventsView : public QWidget
{
  public:
    explicit EventsView(QWidget* parent = nullptr);
    ~EventsView() override;

    void setEvents(const EventLog& log);
    /// The moment that is shown elsewhere; none for the present. What came later is fainter, and
    /// what happened last until then comes into view.
    void setMoment(std::optional<Clock::TimePoint> moment);
    void setOnEvent(std::function<void(const Event& event)> onEvent);

    QListView& list() const;
    const EventsModel& model() const { return *_model; }

  private:
    class List;

    void open(int row) const;

    EventsModel* _model;
    List* _list;
    std::function<void(const Event&)> _onEvent;
};

} // namespace ventrik
