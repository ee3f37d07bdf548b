#pragma once

#include "Model/EventLog.h"

#include <QAbstractListModel>

#include <deque>

namespace ventrik
{

/// The events of a log, the newest first. New ones are inserted on top of the others.
class EventsModel : public QAbstractListModel
{
  public:
    using QAbstractListModel::QAbstractListModel;

    void setEvents(const std::deque<Event>& events);
    const Event& eventAt(int row) const;

    int rowCount(const QModelIndex& parent = {}) const override;
    QVariant data(const QModelIndex& index, int role = Qt::DisplayRole) const override;

  private:
    std::deque<Event> _events; // the newest last
};

/// HH:MM:SS, of the local time.
QString timeTextOf(const Event& event);
QString listText(std::string_view text);

} // namespace ventrik
