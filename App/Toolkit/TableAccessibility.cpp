#include "App/Toolkit/TableAccessibility.h"

#include "App/Toolkit/TableView.h"

#include <QAccessibleWidget>

#include <algorithm>

namespace ventrik
{

namespace
{

class AccessibleTable : public QAccessibleWidget
{
  public:
    explicit AccessibleTable(TableView& table)
        : QAccessibleWidget(&table, QAccessible::List), _table(table)
    {
    }

    int childCount() const override { return static_cast<int>(_table.visibleRows().size()); }
    QAccessibleInterface* child(int index) const override
    {
        const auto rows = _table.visibleRows();
        const auto place = static_cast<std::size_t>(index);
        return index >= 0 && place < rows.size()
                   ? QAccessible::queryAccessibleInterface(rows[place])
                   : nullptr;
    }
    int indexOfChild(const QAccessibleInterface* child) const override
    {
        const auto rows = _table.visibleRows();
        const auto found = std::ranges::find(rows, child->object());
        return found == rows.end() ? -1 : static_cast<int>(found - rows.begin());
    }

  private:
    TableView& _table;
};

class AccessibleRow : public QAccessibleWidget
{
  public:
    explicit AccessibleRow(TableRow& row)
        : QAccessibleWidget(&row, QAccessible::ListItem), _row(row)
    {
    }

    // The row's name says what its labels show.
    int childCount() const override { return 0; }
    QAccessibleInterface* parent() const override
    {
        QWidget* viewport = _row.parentWidget();
        QWidget* table = viewport ? viewport->parentWidget() : nullptr;
        return table ? QAccessible::queryAccessibleInterface(table) : nullptr;
    }
    QAccessible::State state() const override
    {
        QAccessible::State state = QAccessibleWidget::state();
        state.selectable = true;
        state.selected = _row.isSelected();
        state.focusable = true;
        state.focused = _row.hasKeyboardFrame();
        return state;
    }
    QString text(QAccessible::Text kind) const override
    {
        const bool opens = _row.accessory() == TableRowAccessory::DisclosureIndicator;
        if (kind == QAccessible::Description && opens)
            return QStringLiteral("opens a list");
        return QAccessibleWidget::text(kind);
    }

  private:
    TableRow& _row;
};

QAccessibleInterface* makeInterface(const QString&, QObject* object)
{
    if (auto* row = dynamic_cast<TableRow*>(object))
        return new AccessibleRow(*row);
    if (auto* table = dynamic_cast<TableView*>(object))
        return new AccessibleTable(*table);
    return nullptr;
}

} // namespace

void installTableAccessibility()
{
    QAccessible::installFactory(makeInterface);
}

} // namespace ventrik
