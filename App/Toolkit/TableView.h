#pragma once

#include "App/Toolkit/TableRow.h"

#include <QAbstractScrollArea>
#include <QBasicTimer>
#include <QKeySequence>

#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <vector>

namespace ventrik
{

/// Where a row stands.
struct IndexPath {
    int section = 0;
    int row = 0;
    bool operator==(const IndexPath&) const = default;
};

class TableView;

/// What can be done with a row, from its menu or by a key.
struct RowAction {
    QString text;
    QKeySequence key;
    std::function<void()> run;
};

/// What a table shows; it outlives the table's use of it.
class TableViewDataSource
{
  public:
    virtual ~TableViewDataSource() = default;
    virtual int rowsInSection(int section) = 0;
    /// A row that is ready to be shown, reused where possible.
    virtual std::unique_ptr<TableRow> rowForIndexPath(TableView& table, IndexPath indexPath) = 0;
    virtual void rowSelected(TableView& table, std::optional<IndexPath> indexPath) = 0;
    /// The row is about to be used again, for this place or for another one.
    virtual void rowWillBeReused(TableRow&) {}
    /// What copying the row puts on the clipboard; nothing is copied where it is empty.
    virtual QString textForCopying(IndexPath) { return {}; }
    /// What can be done with the row besides.
    virtual std::vector<RowAction> actionsForRow(IndexPath) { return {}; }
};

/// A plain list of rows of one height in one section. Only the rows in view exist; those that leave
/// it wait to be used again.
///
/// One row is the current one: the row touched last, or the one that the keyboard has gone to.
/// Ctrl+C and the context menu copy it, and do with it what else its data source offers. A long
/// press opens that menu, too.
class TableView : public QAbstractScrollArea
{
  public:
    static constexpr int rowHeight = 50;

    /// Empty until it has a data source.
    explicit TableView(QWidget* parent = nullptr);
    explicit TableView(TableViewDataSource& dataSource, QWidget* parent = nullptr);
    ~TableView() override;

    void setDataSource(TableViewDataSource& dataSource) { _dataSource = &dataSource; }

    /// Where a former row stands now; none when it is gone.
    using RowMapping = std::function<std::optional<int>(int)>;

    /// Asks for everything anew; the scroll position stays. Selection, current row and the rows in
    /// view go along with rows that have moved, where a mapping tells so.
    void reloadData(const RowMapping& newPlaceOf = {});
    /// What an empty table says in its middle.
    void setPlaceholder(const QString& text);
    const QString& placeholder() const { return _placeholder; }
    /// The height of all rows together, which may be more than the table's own.
    int contentHeight() const;
    /// A row that waits under that identifier, or none. While an unchanged table is reloaded, every
    /// row is handed out for its own former place.
    std::unique_ptr<TableRow> dequeueReusableRow(const QString& identifier);

    std::optional<IndexPath> indexPathForSelectedRow() const;
    void selectRow(IndexPath indexPath);
    void deselectRow(IndexPath indexPath);

    /// Null for a row out of view.
    TableRow* rowAt(IndexPath indexPath) const;
    /// From the top down.
    std::vector<TableRow*> visibleRows() const;
    void forEachRowInView(const std::function<void(int row, TableRow& widget)>& use) const;
    std::optional<IndexPath> indexPathForCurrentRow() const;
    /// Puts the row's text on the clipboard.
    void copyRow(IndexPath indexPath) const;

  protected:
    void resizeEvent(QResizeEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void scrollContentsBy(int dx, int dy) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void focusInEvent(QFocusEvent* event) override;
    void focusOutEvent(QFocusEvent* event) override;
    void contextMenuEvent(QContextMenuEvent* event) override;
    void timerEvent(QTimerEvent* event) override;

  private:
    struct RowRange {
        int first;
        int end;
        bool contains(int row) const { return row >= first && row < end; }
    };

    RowRange rangeInView() const;
    void moveMarks(const RowMapping& newPlaceOf);
    void keepInRange();
    std::optional<int> rowAtPosition(const QPoint& position) const;
    void updateScrollRange();
    void layoutRows();
    void retire(std::unique_ptr<TableRow> row);
    void showRow(int row);
    void updateLooks();
    void updateLook(int row, TableRow& widget) const;
    void setHighlighted(std::optional<int> row);
    void showKeyboard();
    void activate(int row);
    void moveTo(int row);
    void scrollTo(int row);
    std::optional<int> keyTarget(int key) const;
    bool useKey(const QKeyEvent& event);
    bool useRowKey(const QKeyEvent& event, int row);
    bool scrollSideways(int row, int key);
    bool runAction(const QKeyEvent& event, int row);
    void showMenu(int row, const QPoint& globalPosition);

    TableViewDataSource* _dataSource = nullptr;
    int _rowCount = 0;
    QString _placeholder;
    // Rows are children of the viewport, which goes after them.
    std::map<int, std::unique_ptr<TableRow>> _rows;
    std::map<QString, std::deque<std::unique_ptr<TableRow>>> _reusable;
    std::optional<int> _selected;
    std::optional<int> _pressed;
    QPoint _pressPosition;
    QBasicTimer _longPress;
    // Where the keyboard is; its frame shows once a key has been used.
    std::optional<int> _current;
    bool _showsKeyboardFrame = false;
};

} // namespace ventrik
