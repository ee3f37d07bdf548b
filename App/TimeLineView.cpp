#include "App/TimeLineView.h"

#include "App/Lists/CellsView.h"
#include "App/Lists/EventsView.h"
#include "App/Strip/SignalStrip.h"
#include "App/TimeLineMenu.h"
#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/PushButton.h"
#include "App/Toolkit/Separator.h"
#include "App/Toolkit/TitleBar.h"
#include "Model/CellTable.h"

#include <QHBoxLayout>
#include <QLabel>
#include <QPainter>
#include <QSplitter>
#include <QTabBar>
#include <QVBoxLayout>

#include <algorithm>
#include <utility>

namespace ventrik
{

namespace
{

constexpr int barMargin = 10;
constexpr int statusPoints = 14;
constexpr int handleWidth = 5;

/// The bar along the top, as that of the panes beside it.
class TimeLineBar : public QWidget
{
  public:
    explicit TimeLineBar(QWidget* parent) : QWidget(parent)
    {
        setFixedHeight(TitleBar::barHeight);
        setAutoFillBackground(true);
    }

  protected:
    void paintEvent(QPaintEvent*) override
    {
        QPainter(this).fillRect(0, height() - 1, width(), 1, separatorColor(palette()));
    }
};

// The series go on while nothing of this is seen.
std::vector<std::vector<SeriesPoint>> pointsOf(const PinnedSeries& series)
{
    std::vector<std::vector<SeriesPoint>> points;
    for (const PinnedSeries::Series& one : series.series())
        points.push_back(one.points);
    return points;
}

} // namespace

TimeLineView::TimeLineView(TimeLine& timeLine, const Clock& clock)
    : _timeLine(timeLine),
      _clock(clock),
      _status(makeLabel(systemFont(statusPoints, FontWeight::Regular), nullptr)),
      _pause(new PushButton),
      _menuButton(new PushButton(QStringLiteral("More"))),
      _strip(new SignalStrip),
      _menu(new TimeLineMenu(timeLine, clock, *_strip, this)),
      _cells(new CellsView),
      _events(new EventsView),
      _tabs(new QTabBar)
{
    setAccessibleName(QStringLiteral("Time line"));
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    _menuButton->setAccessibleDescription(QStringLiteral("Files of the time line, and its keys"));
    layout->addWidget(makeBar());
    auto* parts = new QSplitter(Qt::Vertical, this);
    parts->setChildrenCollapsible(false);
    parts->setHandleWidth(handleWidth);
    parts->addWidget(_strip);
    parts->addWidget(makeLists());
    parts->setStretchFactor(0, 3);
    parts->setStretchFactor(1, 2);
    layout->addWidget(parts, 1);
    setFocusProxy(_strip);
    _status->setAlignment(Qt::AlignLeft | Qt::AlignVCenter);
}

QWidget* TimeLineView::makeLists()
{
    auto* lists = new QWidget;
    _tabs->addTab(QStringLiteral("Cells"));
    _tabs->addTab(QStringLiteral("Events"));
    _tabs->setDrawBase(false);
    _tabs->setExpanding(true);
    _tabs->setFont(systemFont(statusPoints, FontWeight::Regular));
    connect(_tabs, &QTabBar::currentChanged, this, [this] { layOutLists(); });
    auto* column = new QVBoxLayout(lists);
    column->setContentsMargins(0, 0, 0, 0);
    column->setSpacing(0);
    column->addWidget(_tabs);
    auto* row = new QHBoxLayout;
    row->setSpacing(1);
    row->addWidget(_cells, 2);
    row->addWidget(_events, 1);
    column->addLayout(row, 1);
    layOutLists();
    return lists;
}

void TimeLineView::layOutLists()
{
    const bool areBoth = width() >= widthForBothLists;
    _tabs->setVisible(!areBoth);
    _cells->setVisible(areBoth || _tabs->currentIndex() == 0);
    _events->setVisible(areBoth || _tabs->currentIndex() == 1);
}

void TimeLineView::resizeEvent(QResizeEvent*)
{
    layOutLists();
}

QWidget* TimeLineView::makeBar()
{
    auto* bar = new TimeLineBar(this);
    auto* layout = new QHBoxLayout(bar);
    layout->setContentsMargins(barMargin, 0, barMargin, 0);
    layout->addWidget(_status, 1);
    layout->addWidget(_pause);
    layout->addWidget(_menuButton);
    connect(_menuButton, &QPushButton::clicked, this, [this] { _menu->openBelow(*_menuButton); });
    connect(_pause, &QPushButton::clicked, this, [this] {
        if (_listener.onPause)
            _listener.onPause();
    });
    return bar;
}

void TimeLineView::setListener(TimeLineListener listener)
{
    _listener = std::move(listener);
    _cells->setOnOpen([this](const std::string& path) {
        if (_listener.onOpen)
            _listener.onOpen(path);
    });
    _menu->setOnSaved([this](const std::string& fileName) {
        if (_listener.onSaved)
            _listener.onSaved(fileName);
    });
    _menu->setOnPins([this] { update(); });
    _events->setOnEvent([this](const Event& event) { _timeLine.showEvent(event); });
    _strip->setListener({[this](Clock::TimePoint time) { _timeLine.showTime(time); },
                         [this] {
                             if (_listener.onLive)
                                 _listener.onLive();
                         }});
}

void TimeLineView::setCaptureName(const std::string& name)
{
    _menu->setCaptureName(name);
}

void TimeLineView::setStatus(const QString& text, bool isPaused, const QString& live)
{
    _status->setText(text);
    _pause->setText(isPaused ? live : QStringLiteral("Pause"));
}

void TimeLineView::update()
{
    updateStrip();
    _cells->setCells(cellsOf(_timeLine.shown(), _timeLine.pausedAt().value_or(_timeLine.end())));
    _events->setEvents(_timeLine.events());
    _events->setMoment(_timeLine.pausedAt());
}

// A dragged cursor asks often, and there may be millions of points.
void TimeLineView::updateStrip()
{
    const bool isNew = _version != _timeLine.version();
    if (isNew || _end != _timeLine.end()) {
        _end = _timeLine.end();
        const auto former = isNew ? std::exchange(_points, pointsOf(_timeLine.series()))
                                  : std::vector<std::vector<SeriesPoint>>();
        _strip->setSecondsFromUtc(_clock.timeZone(_end).secondsFromUtc);
        _strip->setData(stripData()); // the former points are shown until then
        _version = _timeLine.version();
    }
    _strip->setCursor(_timeLine.pausedAt());
}

StripData TimeLineView::stripData() const
{
    StripData shown;
    for (std::size_t i = 0; i < _points.size(); ++i) {
        const PinnedSeries::Series& series = _timeLine.series().series()[i];
        shown.lines.push_back({series.pin.name, series.unit, _points[i]});
    }
    for (const Event& event : _timeLine.events().events())
        if (event.isMark)
            shown.marks.push_back({event.time, event.text, event.kind == EventKind::RRC});
    shown.last = _end;
    shown.first = _timeLine.store().isEmpty() ? _end : _timeLine.store().firstTime();
    return shown;
}

} // namespace ventrik
