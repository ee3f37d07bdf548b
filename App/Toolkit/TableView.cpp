#include "App/Toolkit/TableView.h"

#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/TableAccessibility.h"
#include "App/Toolkit/ThinScrollBar.h"

#include <QAccessible>
#include <QApplication>
#include <QClipboard>
#include <QContextMenuEvent>
#include <QKeyEvent>
#include <QMenu>
#include <QMouseEvent>
#include <QPainter>
#include <QScrollBar>
#include <QScroller>

#include <algorithm>
#include <limits>
#include <utility>

namespace ventrik
{

namespace
{

constexpr int wheelStep = 20;
constexpr int longPressTime = 600; // ms
constexpr int placeholderPoints = 15;
constexpr int placeholderMargin = 24;

} // namespace

TableView::TableView(QWidget* parent) : QAbstractScrollArea(parent)
{
    installTableAccessibility();
    setFrameShape(QFrame::NoFrame);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setVerticalScrollBar(new ThinScrollBar(this));
    setFocusPolicy(Qt::StrongFocus);
    verticalScrollBar()->setSingleStep(wheelStep);
    viewport()->setBackgroundRole(QPalette::Base);
    QScroller::grabGesture(viewport(), QScroller::TouchGesture);
}

TableView::TableView(TableViewDataSource& dataSource, QWidget* parent) : TableView(parent)
{
    setDataSource(dataSource);
}

TableView::~TableView() = default;

int TableView::contentHeight() const
{
    const qint64 height = qint64{_rowCount} * rowHeight;
    return static_cast<int>(std::min<qint64>(height, std::numeric_limits<int>::max()));
}

void TableView::reloadData(const RowMapping& newPlaceOf)
{
    const int former = verticalScrollBar()->value();
    const auto top =
        newPlaceOf && former > 0 ? newPlaceOf(former / rowHeight) : std::optional<int>();
    if (newPlaceOf)
        moveMarks(newPlaceOf);
    // To the front, the topmost one foremost: each row comes back to its own place.
    for (auto row = _rows.rbegin(); row != _rows.rend(); ++row) {
        _dataSource->rowWillBeReused(*row->second);
        _reusable[row->second->reuseIdentifier()].push_front(std::move(row->second));
    }
    _rows.clear();
    _rowCount = _dataSource ? std::max(0, _dataSource->rowsInSection(0)) : 0;
    keepInRange();
    updateScrollRange();
    if (top)
        verticalScrollBar()->setValue(*top * rowHeight + former % rowHeight);
    layoutRows();
}

void TableView::moveMarks(const RowMapping& newPlaceOf)
{
    for (std::optional<int>* row : {&_selected, &_pressed})
        if (*row)
            *row = newPlaceOf(**row);
    // The keyboard stays at its place where its row is gone.
    if (_current)
        _current = newPlaceOf(*_current).value_or(*_current);
}

void TableView::keepInRange()
{
    for (std::optional<int>* row : {&_selected, &_pressed})
        if (*row && **row >= _rowCount)
            row->reset();
    if (_current)
        _current = _rowCount > 0 ? std::optional(std::min(*_current, _rowCount - 1)) : std::nullopt;
}

std::unique_ptr<TableRow> TableView::dequeueReusableRow(const QString& identifier)
{
    const auto waiting = _reusable.find(identifier);
    if (waiting == _reusable.end() || waiting->second.empty())
        return nullptr;
    auto row = std::move(waiting->second.front());
    waiting->second.pop_front();
    return row;
}

TableView::RowRange TableView::rangeInView() const
{
    const int top = verticalScrollBar()->value();
    const int bottom = top + viewport()->height();
    return {std::min(top / rowHeight, _rowCount),
            std::min((bottom + rowHeight - 1) / rowHeight, _rowCount)};
}

void TableView::updateScrollRange()
{
    const int height = viewport()->height();
    verticalScrollBar()->setRange(0, std::max(0, contentHeight() - height));
    verticalScrollBar()->setPageStep(height);
}

void TableView::layoutRows()
{
    const RowRange range = rangeInView();
    // Out first, so that the rows that come in can be made of them.
    for (auto row = _rows.begin(); row != _rows.end();) {
        if (range.contains(row->first)) {
            ++row;
            continue;
        }
        retire(std::move(row->second));
        row = _rows.erase(row);
    }
    for (int row = range.first; row < range.end; ++row)
        showRow(row);
    // What waits is hidden only now: a row that is used again at once never leaves the screen.
    for (const auto& [identifier, waiting] : _reusable)
        for (const auto& row : waiting)
            row->hide();
}

void TableView::retire(std::unique_ptr<TableRow> row)
{
    _dataSource->rowWillBeReused(*row);
    _reusable[row->reuseIdentifier()].push_back(std::move(row));
}

void TableView::showRow(int row)
{
    auto& widget = _rows[row];
    if (!widget) {
        widget = _dataSource->rowForIndexPath(*this, {0, row});
        widget->setParent(viewport());
        updateLook(row, *widget);
    }
    widget->setGeometry(0, row * rowHeight - verticalScrollBar()->value(), viewport()->width(),
                        rowHeight);
    widget->show();
}

void TableView::updateLook(int row, TableRow& widget) const
{
    widget.setSelected(row == _selected || row == _pressed);
    widget.setKeyboardFrame(row == _current && _showsKeyboardFrame && hasFocus());
}

void TableView::updateLooks()
{
    if (_rowCount == 0)
        viewport()->update();
    for (const auto& [row, widget] : _rows)
        updateLook(row, *widget);
}

std::optional<IndexPath> TableView::indexPathForSelectedRow() const
{
    return _selected ? std::optional(IndexPath{0, *_selected}) : std::nullopt;
}

void TableView::selectRow(IndexPath indexPath)
{
    _selected = indexPath.row;
    updateLooks();
}

void TableView::deselectRow(IndexPath indexPath)
{
    if (_selected == indexPath.row)
        _selected.reset();
    updateLooks();
}

TableRow* TableView::rowAt(IndexPath indexPath) const
{
    const auto row = _rows.find(indexPath.row);
    return row == _rows.end() ? nullptr : row->second.get();
}

std::vector<TableRow*> TableView::visibleRows() const
{
    std::vector<TableRow*> result;
    for (const auto& [row, widget] : _rows)
        result.push_back(widget.get());
    return result;
}

std::optional<IndexPath> TableView::indexPathForCurrentRow() const
{
    return _current ? std::optional(IndexPath{0, *_current}) : std::nullopt;
}

void TableView::copyRow(IndexPath indexPath) const
{
    const QString text = _dataSource->textForCopying(indexPath);
    if (!text.isEmpty())
        QGuiApplication::clipboard()->setText(text);
}

void TableView::setPlaceholder(const QString& text)
{
    if (text == _placeholder)
        return;
    _placeholder = text;
    setAccessibleDescription(text);
    viewport()->update();
}

// Rows cover what is drawn here.
void TableView::paintEvent(QPaintEvent*)
{
    if (_rowCount > 0)
        return;
    QPainter painter(viewport());
    if (_showsKeyboardFrame && hasFocus())
        drawKeyboardFrame(painter, viewport()->rect(), palette());
    QColor grey = palette().color(QPalette::Text);
    grey.setAlphaF(0.6F);
    painter.setPen(grey);
    painter.setFont(systemFont(placeholderPoints, FontWeight::Regular));
    painter.drawText(viewport()->rect().adjusted(placeholderMargin, 0, -placeholderMargin, 0),
                     static_cast<int>(Qt::AlignCenter) | Qt::TextWrapAnywhere | Qt::TextWordWrap,
                     _placeholder);
}

void TableView::resizeEvent(QResizeEvent*)
{
    updateScrollRange();
    layoutRows();
}

void TableView::scrollContentsBy(int, int)
{
    layoutRows();
}

std::optional<int> TableView::rowAtPosition(const QPoint& position) const
{
    const int row = (position.y() + verticalScrollBar()->value()) / rowHeight;
    return position.y() >= 0 && row < _rowCount ? std::optional(row) : std::nullopt;
}

void TableView::forEachRowInView(const std::function<void(int, TableRow&)>& use) const
{
    for (const auto& [row, widget] : _rows)
        use(row, *widget);
}

void TableView::setHighlighted(std::optional<int> row)
{
    _pressed = row;
    updateLooks();
}

void TableView::mousePressEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton) {
        event->ignore();
        return;
    }
    _showsKeyboardFrame = false;
    _pressPosition = event->pos();
    setHighlighted(rowAtPosition(event->pos()));
    _longPress.start(longPressTime, this);
}

void TableView::mouseMoveEvent(QMouseEvent* event)
{
    // A drag means something else than the row.
    if ((event->pos() - _pressPosition).manhattanLength() < QApplication::startDragDistance())
        return;
    _longPress.stop();
    setHighlighted(std::nullopt);
}

void TableView::mouseReleaseEvent(QMouseEvent* event)
{
    if (event->button() != Qt::LeftButton)
        return;
    _longPress.stop();
    const std::optional<int> row = std::exchange(_pressed, std::nullopt);
    if (row && row == rowAtPosition(event->pos()))
        activate(*row);
    else
        updateLooks();
}

// The second of two quick clicks belongs to the first, also where that has opened this table.
void TableView::mouseDoubleClickEvent(QMouseEvent*) {}

void TableView::activate(int row)
{
    _current = row;
    selectRow({0, row});
    _dataSource->rowSelected(*this, IndexPath{0, row});
}

std::optional<int> TableView::keyTarget(int key) const
{
    const int last = _rowCount - 1;
    const int page = std::max(1, viewport()->height() / rowHeight);
    // The first key goes to what is in view.
    const int start = rangeInView().first;
    switch (key) {
    case Qt::Key_Up:
        return _current ? *_current - 1 : start;
    case Qt::Key_Down:
        return _current ? *_current + 1 : start;
    case Qt::Key_PageUp:
        return _current.value_or(start) - page;
    case Qt::Key_PageDown:
        return _current.value_or(start) + page;
    case Qt::Key_Home:
        return 0;
    case Qt::Key_End:
        return last;
    default:
        return std::nullopt;
    }
}

void TableView::keyPressEvent(QKeyEvent* event)
{
    if (_rowCount == 0 || !(useKey(*event) || (_current && useRowKey(*event, *_current))))
        event->ignore();
}

bool TableView::useKey(const QKeyEvent& event)
{
    const bool isPlain = (event.modifiers() & ~Qt::KeypadModifier) == Qt::NoModifier;
    const auto target = isPlain ? keyTarget(event.key()) : std::nullopt;
    if (target)
        moveTo(std::clamp(*target, 0, _rowCount - 1));
    return target.has_value();
}

bool TableView::useRowKey(const QKeyEvent& event, int row)
{
    if (event.matches(QKeySequence::Copy)) {
        copyRow({0, row});
        return true;
    }
    const bool isPlain = (event.modifiers() & ~Qt::KeypadModifier) == Qt::NoModifier;
    if (isPlain && (event.key() == Qt::Key_Return || event.key() == Qt::Key_Enter)) {
        activate(row);
        return true;
    }
    if (isPlain && (event.key() == Qt::Key_Left || event.key() == Qt::Key_Right))
        return scrollSideways(row, event.key());
    return runAction(event, row);
}

bool TableView::runAction(const QKeyEvent& event, int row)
{
    const QKeySequence pressed(event.keyCombination());
    for (const RowAction& action : _dataSource->actionsForRow({0, row}))
        if (action.key == pressed) {
            action.run();
            return true;
        }
    return false;
}

bool TableView::scrollSideways(int row, int key)
{
    TableRow* widget = rowAt({0, row});
    return widget && widget->scrollSideways(key == Qt::Key_Right ? 1 : -1);
}

void TableView::moveTo(int row)
{
    _current = row;
    _showsKeyboardFrame = true;
    scrollTo(row);
    updateLooks();
    if (TableRow* widget = rowAt({0, row})) {
        QAccessibleEvent focused(widget, QAccessible::Focus);
        QAccessible::updateAccessibility(&focused);
    }
}

void TableView::scrollTo(int row)
{
    const int top = row * rowHeight;
    const int value = verticalScrollBar()->value();
    const int highest = std::min(value, top);
    verticalScrollBar()->setValue(std::max(highest, top + rowHeight - viewport()->height()));
}

void TableView::contextMenuEvent(QContextMenuEvent* event)
{
    if (event->reason() == QContextMenuEvent::Mouse)
        _current = rowAtPosition(event->pos());
    if (_current)
        showMenu(*_current, event->globalPos());
}

void TableView::timerEvent(QTimerEvent* event)
{
    if (event->timerId() != _longPress.timerId())
        return QAbstractScrollArea::timerEvent(event);
    _longPress.stop();
    const std::optional<int> row = std::exchange(_pressed, std::nullopt);
    updateLooks();
    if (row)
        showMenu(*row, viewport()->mapToGlobal(_pressPosition));
}

void TableView::showMenu(int row, const QPoint& globalPosition)
{
    _current = row;
    const std::vector<RowAction> actions = _dataSource->actionsForRow({0, row});
    const bool canCopy = !_dataSource->textForCopying({0, row}).isEmpty();
    if (!canCopy && actions.empty())
        return;
    auto* menu = new QMenu(this);
    menu->setAttribute(Qt::WA_DeleteOnClose);
    if (canCopy) {
        QAction* copy = menu->addAction(QStringLiteral("Copy"));
        copy->setShortcut(QKeySequence::Copy);
        // The row may have moved by then, and the current one with it.
        connect(copy, &QAction::triggered, this, [this] {
            if (_current)
                copyRow({0, *_current});
        });
    }
    for (const RowAction& action : actions) {
        QAction* item = menu->addAction(action.text);
        item->setShortcut(action.key);
        connect(item, &QAction::triggered, this, action.run);
    }
    menu->popup(globalPosition);
}

void TableView::focusInEvent(QFocusEvent* event)
{
    if (event->reason() == Qt::TabFocusReason || event->reason() == Qt::BacktabFocusReason)
        showKeyboard();
    updateLooks();
}

// Whoever walks by keys is to see where they are.
void TableView::showKeyboard()
{
    _showsKeyboardFrame = true;
    if (!_current && _rowCount > 0)
        _current = rangeInView().first;
}

void TableView::focusOutEvent(QFocusEvent*)
{
    updateLooks();
}

} // namespace ventrik
