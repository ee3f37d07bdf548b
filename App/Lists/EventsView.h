#pragma once

#include "Model/EventLog.h"

#include <QWidget>

#include <functional>

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
