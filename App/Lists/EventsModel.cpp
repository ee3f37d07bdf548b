#include "App/Lists/EventsModel.h"

#include "App/Toolkit/PlainText.h"

#include <QDateTime>

#include <algorithm>

namespace ventrik
{

namespace
{

QDateTime localTimeOf(const Event& event)
{
    const auto time = event.time.time_since_epoch();
    return QDateTime::fromMSecsSinceEpoch(
        std::chrono::floor<std::chrono::milliseconds>(time).count());
}

bool isSame(const Event& a, const Event& b)
{
    return a.moment == b.moment && a.time == b.time && a.kind == b.kind && a.text == b.text &&
           a.path == b.path;
}

} // namespace

QString listText(std::string_view text)
{
    return oneLine(QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size())));
}

QString timeTextOf(const Event& event)
{
    return localTimeOf(event).toString(QStringLiteral("HH:mm:ss"));
}

// Those after the newest that is here are new; of those before it the oldest may be gone.
void EventsModel::setEvents(const std::deque<Event>& events)
{
    auto known = events.rend();
    if (!_events.empty())
        known = std::find_if(events.rbegin(), events.rend(),
                             [this](const Event& event) { return isSame(event, _events.back()); });
    const auto kept = static_cast<std::size_t>(events.rend() - known);
    if (_events.size() > kept) {
        beginRemoveRows({}, static_cast<int>(kept), rowCount() - 1);
        _events.erase(_events.begin(), _events.end() - static_cast<std::ptrdiff_t>(kept));
        endRemoveRows();
    }
    if (known == events.rbegin())
        return;
    beginInsertRows({}, 0, static_cast<int>(known - events.rbegin()) - 1);
    _events.insert(_events.end(), known.base(), events.end());
    endInsertRows();
}

const Event& EventsModel::eventAt(int row) const
{
    return _events[_events.size() - 1 - static_cast<std::size_t>(row)];
}

int EventsModel::rowCount(const QModelIndex& parent) const
{
    return parent.isValid() ? 0 : static_cast<int>(_events.size());
}

QVariant EventsModel::data(const QModelIndex& index, int role) const
{
    if (!index.isValid())
        return {};
    const Event& event = eventAt(index.row());
    const QString kind = listText(nameOf(event.kind));
    switch (role) {
    case Qt::DisplayRole:
        return QStringList{timeTextOf(event), kind, listText(event.text)}.join(
            QStringLiteral("  "));
    case Qt::AccessibleTextRole:
        return QStringList{kind, listText(event.text), timeTextOf(event)}.join(
            QStringLiteral(", "));
    case Qt::ToolTipRole:
        return plainToolTip(
            localTimeOf(event).toString(QStringLiteral("yyyy-MM-dd HH:mm:ss.zzz ")) +
            listText(event.text));
    default:
        return {};
    }
}

} // namespace ventrik
