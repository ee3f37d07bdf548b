#include "App/Strip/StripAccessibility.h"

#include "App/Strip/SignalStrip.h"

#include <QAccessibleWidget>
#include <QPointer>

#include <array>
#include <map>

namespace ventrik
{

namespace
{

constexpr std::array<const char*, 5> columnNames{"Name", "Value", "Unit", "Minimum", "Maximum"};
constexpr int columns = static_cast<int>(columnNames.size());

QString textOf(const SignalStrip& strip, int row, int column)
{
    if (row < 0 || row >= static_cast<int>(strip.rowCount()))
        return {};
    const SignalStrip::Row shown = strip.row(static_cast<std::size_t>(row));
    const std::array texts{&shown.name, &shown.value, &shown.unit, &shown.minimum, &shown.maximum};
    return QString::fromStdString(*texts.at(static_cast<std::size_t>(column)));
}

/// One text of the table. It stands for its place, whatever is there.
class StripCell : public QAccessibleInterface, public QAccessibleTableCellInterface
{
  public:
    StripCell(SignalStrip& strip, int row, int column) : _strip(&strip), _row(row), _column(column)
    {
    }

    bool isValid() const override { return _strip && _row < static_cast<int>(_strip->rowCount()); }
    QObject* object() const override { return nullptr; }
    QAccessibleInterface* parent() const override
    {
        return _strip ? QAccessible::queryAccessibleInterface(_strip) : nullptr;
    }
    QAccessibleInterface* child(int) const override { return nullptr; }
    QAccessibleInterface* childAt(int, int) const override { return nullptr; }
    int childCount() const override { return 0; }
    int indexOfChild(const QAccessibleInterface*) const override { return -1; }
    QAccessible::Role role() const override { return QAccessible::Cell; }
    QAccessible::State state() const override { return {}; }
    QString text(QAccessible::Text kind) const override
    {
        return isValid() && kind == QAccessible::Name ? textOf(*_strip, _row, _column) : QString();
    }
    void setText(QAccessible::Text, const QString&) override {}
    // A cell has no place of its own in the picture.
    QRect rect() const override
    {
        return _strip ? QRect(_strip->mapToGlobal(QPoint()), _strip->size()) : QRect();
    }
    void* interface_cast(QAccessible::InterfaceType type) override
    {
        return type == QAccessible::TableCellInterface
                   ? static_cast<QAccessibleTableCellInterface*>(this)
                   : nullptr;
    }

    int columnExtent() const override { return 1; }
    int rowExtent() const override { return 1; }
    int columnIndex() const override { return _column; }
    int rowIndex() const override { return _row; }
    QList<QAccessibleInterface*> columnHeaderCells() const override { return {}; }
    QList<QAccessibleInterface*> rowHeaderCells() const override { return {}; }
    bool isSelected() const override { return false; }
    QAccessibleInterface* table() const override { return parent(); }

  private:
    QPointer<SignalStrip> _strip;
    int _row;
    int _column;
};

class AccessibleStrip : public QAccessibleWidget, public QAccessibleTableInterface
{
  public:
    explicit AccessibleStrip(SignalStrip& strip)
        : QAccessibleWidget(&strip, QAccessible::Table), _strip(strip)
    {
    }
    ~AccessibleStrip() override
    {
        for (const auto& [place, id] : _cells)
            QAccessible::deleteAccessibleInterface(id);
    }
    AccessibleStrip(const AccessibleStrip&) = delete;
    AccessibleStrip& operator=(const AccessibleStrip&) = delete;

    void* interface_cast(QAccessible::InterfaceType type) override
    {
        return type == QAccessible::TableInterface ? static_cast<QAccessibleTableInterface*>(this)
                                                   : QAccessibleWidget::interface_cast(type);
    }
    int childCount() const override { return rowCount() * columns; }
    QAccessibleInterface* child(int index) const override
    {
        return cellAt(index / columns, index % columns);
    }
    int indexOfChild(const QAccessibleInterface* child) const override
    {
        auto* cell = const_cast<QAccessibleInterface*>(child)->tableCellInterface();
        return cell && cell->table() == this ? cell->rowIndex() * columns + cell->columnIndex()
                                             : -1;
    }

    QAccessibleInterface* cellAt(int row, int column) const override
    {
        if (row < 0 || row >= rowCount() || column < 0 || column >= columns)
            return nullptr;
        auto& id = _cells[{row, column}];
        if (id == 0)
            id = QAccessible::registerAccessibleInterface(new StripCell(_strip, row, column));
        return QAccessible::accessibleInterface(id);
    }
    int rowCount() const override { return static_cast<int>(_strip.rowCount()); }
    int columnCount() const override { return columns; }
    QString columnDescription(int column) const override
    {
        return column < 0 || column >= columns
                   ? QString()
                   : QString::fromLatin1(columnNames[static_cast<std::size_t>(column)]);
    }
    QString rowDescription(int row) const override { return textOf(_strip, row, 0); }
    QAccessibleInterface* caption() const override { return nullptr; }
    QAccessibleInterface* summary() const override { return nullptr; }

    // There is nothing to select.
    int selectedCellCount() const override { return 0; }
    int selectedColumnCount() const override { return 0; }
    int selectedRowCount() const override { return 0; }
    QList<QAccessibleInterface*> selectedCells() const override { return {}; }
    QList<int> selectedColumns() const override { return {}; }
    QList<int> selectedRows() const override { return {}; }
    bool isColumnSelected(int) const override { return false; }
    bool isRowSelected(int) const override { return false; }
    bool selectRow(int) override { return false; }
    bool selectColumn(int) override { return false; }
    bool unselectRow(int) override { return false; }
    bool unselectColumn(int) override { return false; }
    void modelChange(QAccessibleTableModelChangeEvent*) override {}

  private:
    SignalStrip& _strip;
    // The toolkit owns the cells; they are made when they are asked for.
    mutable std::map<std::pair<int, int>, QAccessible::Id> _cells;
};

QAccessibleInterface* makeInterface(const QString&, QObject* object)
{
    auto* strip = dynamic_cast<SignalStrip*>(object);
    return strip ? new AccessibleStrip(*strip) : nullptr;
}

} // namespace

void installStripAccessibility()
{
    QAccessible::installFactory(makeInterface);
}

} // namespace ventrik
