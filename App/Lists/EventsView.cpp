#include "App/Lists/EventsView.h"

#include "App/Lists/EventsModel.h"
#include "App/Lists/ListLook.h"
#include "App/Toolkit/Fonts.h"

#include <QClipboard>
#include <QGuiApplication>
#include <QKeyEvent>
#include <QListView>
#include <QPainter>
#include <QScrollBar>
#include <QStyledItemDelegate>
#include <QVBoxLayout>

#include <algorithm>
#include <optional>
#include <utility>

namespace ventrik
{

namespace
{

// Where there is room for it, an event is one line.
constexpr int leastWidthOfLine = 520;
constexpr int heightOfTwoLines = 50;
constexpr int kindWidth = 104;

/// Draws an event's time, kind and text: side by side, or the text below the others.
class EventLines : public QStyledItemDelegate
{
  public:
    using QStyledItemDelegate::QStyledItemDelegate;

    /// What happened later is fainter.
    void setMoment(std::optional<Clock::TimePoint> moment) { _moment = moment; }

    static int rowHeight(int width)
    {
        return width < leastWidthOfLine ? heightOfTwoLines : listRowHeight;
    }

    // The width is that of the list, whatever its layout has been so far.
    QSize sizeHint(const QStyleOptionViewItem& option, const QModelIndex&) const override
    {
        const auto* view = static_cast<const QAbstractItemView*>(option.widget);
        const int width = view->viewport()->width();
        return {width, rowHeight(width)};
    }

    void paint(QPainter* painter, const QStyleOptionViewItem& option,
               const QModelIndex& index) const override
    {
        const Event& event = static_cast<const EventsModel*>(index.model())->eventAt(index.row());
        painter->save();
        drawListRow(*painter, option, listMargin);
        const QRect area = option.rect.adjusted(listMargin, 0, -listMargin, -1);
        if (option.rect.width() < leastWidthOfLine)
            drawTwoLines(*painter, area, option, event);
        else
            drawLine(*painter, area, option, event);
        painter->restore();
    }

  private:
    static QColor quiet(const QStyleOptionViewItem& option)
    {
        return option.state.testFlag(QStyle::State_Selected) ? textColor(option)
                                                             : quietTextColor(option.palette);
    }

    // What something is now says more than what it was before.
    static void drawText(QPainter& painter, const QRect& area, const QString& text)
    {
        const auto mode = text.contains(QStringLiteral("→")) ? Qt::ElideMiddle : Qt::ElideRight;
        painter.drawText(area, static_cast<int>(Qt::AlignLeft | Qt::AlignVCenter),
                         painter.fontMetrics().elidedText(text, mode, area.width()));
    }

    void drawEventText(QPainter& painter, const QRect& area, const QStyleOptionViewItem& option,
                       const Event& event) const
    {
        const auto weight = event.kind == EventKind::Alert ? FontWeight::Bold : FontWeight::Regular;
        painter.setFont(systemFont(listFont().pixelSize(), weight));
        painter.setPen(_moment && event.time > *_moment ? quiet(option) : textColor(option));
        drawText(painter, area, listText(event.text));
    }

    void drawLine(QPainter& painter, const QRect& area, const QStyleOptionViewItem& option,
                  const Event& event) const
    {
        const QString time = timeTextOf(event);
        const int timeWidth = measured(time, listFont()).width() + 2 * listMargin;
        painter.setFont(listFont());
        painter.setPen(quiet(option));
        drawText(painter, area, time);
        drawText(painter, area.adjusted(timeWidth, 0, 0, 0), listText(nameOf(event.kind)));
        drawEventText(painter, area.adjusted(timeWidth + kindWidth, 0, 0, 0), option, event);
    }

    void drawTwoLines(QPainter& painter, const QRect& area, const QStyleOptionViewItem& option,
                      const Event& event) const
    {
        constexpr int margin = 5;
        const QRect upper(area.left(), area.top() + margin, area.width(), area.height() * 2 / 5);
        const QRect lower(area.left(), upper.bottom() + 1, area.width(),
                          area.bottom() - margin - upper.bottom());
        painter.setFont(listHeaderFont());
        painter.setPen(quiet(option));
        drawText(painter, upper,
                 timeTextOf(event) + QStringLiteral("   ") + listText(nameOf(event.kind)));
        drawEventText(painter, lower, option, event);
    }

    std::optional<Clock::TimePoint> _moment;
};

} // namespace

/// The list itself: keeps what is read in its place, and opens and copies rows by keys.
class EventsView::List : public QListView
{
  public:
    List(EventsModel& model, QWidget* parent) : QListView(parent), _model(model)
    {
        makePlain(*this);
        setModel(&model);
        setItemDelegate(_lines);
        setUniformItemSizes(true);
        setResizeMode(QListView::Adjust);
        setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
        setAccessibleName(QStringLiteral("Events"));
    }

    void setOnOpen(std::function<void(int row)> onOpen) { _onOpen = std::move(onOpen); }
    void setEvents(const std::deque<Event>& events);
    void setMoment(std::optional<Clock::TimePoint> moment);

  protected:
    void keyPressEvent(QKeyEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

  private:
    template <typename Change>
    void keepInPlace(const Change& change);

    EventsModel& _model;
    EventLines* _lines = new EventLines(this);
    std::optional<Clock::TimePoint> _moment;
    std::function<void(int)> _onOpen;
};

// At the top new events push the others down; further down they must not.
template <typename Change>
void EventsView::List::keepInPlace(const Change& change)
{
    const bool isAtTop = verticalScrollBar()->value() == 0;
    const QPersistentModelIndex top = indexAt({1, 1});
    const int offset = top.isValid() ? visualRect(top).top() : 0;
    change();
    doItemsLayout();
    if (!isAtTop && top.isValid())
        verticalScrollBar()->setValue(top.row() * EventLines::rowHeight(viewport()->width()) -
                                      offset);
}

void EventsView::List::setEvents(const std::deque<Event>& events)
{
    keepInPlace([&] { _model.setEvents(events); });
}

void EventsView::List::setMoment(std::optional<Clock::TimePoint> moment)
{
    if (std::exchange(_moment, moment) == moment)
        return;
    _lines->setMoment(moment);
    int row = 0;
    while (moment && row < _model.rowCount() - 1 && _model.eventAt(row).time > *moment)
        ++row;
    scrollTo(_model.index(row), moment ? EnsureVisible : PositionAtTop);
    viewport()->update();
}

// Another width may make the rows higher or lower.
void EventsView::List::resizeEvent(QResizeEvent* event)
{
    keepInPlace([&] { QListView::resizeEvent(event); });
}

void EventsView::List::keyPressEvent(QKeyEvent* event)
{
    const QModelIndex current = currentIndex();
    const bool isEnter = event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter;
    if (current.isValid() && isEnter && _onOpen)
        _onOpen(current.row());
    else if (current.isValid() && event->matches(QKeySequence::Copy))
        QGuiApplication::clipboard()->setText(current.data().toString());
    else
        QListView::keyPressEvent(event);
}

void EventsView::List::paintEvent(QPaintEvent* event)
{
    QListView::paintEvent(event);
    if (_model.rowCount() > 0)
        return;
    QPainter painter(viewport());
    drawPlaceholder(painter, viewport()->rect(), palette(), QStringLiteral("No events yet"));
}

EventsView::EventsView(QWidget* parent)
    : QWidget(parent), _model(new EventsModel(this)), _list(new List(*_model, this))
{
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(_list);
    setFocusProxy(_list);
    _list->setOnOpen([this](int row) { open(row); });
    connect(_list, &QListView::clicked, this,
            [this](const QModelIndex& index) { open(index.row()); });
}

EventsView::~EventsView() = default;

void EventsView::setEvents(const EventLog& log)
{
    _list->setEvents(log.events());
}

void EventsView::setMoment(std::optional<Clock::TimePoint> moment)
{
    _list->setMoment(moment);
}

void EventsView::setOnEvent(std::function<void(const Event& event)> onEvent)
{
    _onEvent = std::move(onEvent);
}

QListView& EventsView::list() const
{
    return *_list;
}

void EventsView::open(int row) const
{
    // The callback may bring other events.
    const Event event = _model->eventAt(row);
    if (_onEvent)
        _onEvent(event);
}

} // namespace ventrik
