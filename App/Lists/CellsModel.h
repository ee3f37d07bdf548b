#pragma once

#include "Model/CellTable.h"

#include <QAbstractTableModel>

#include <optional>
#include <vector>

namespace ventrik
{

/// Cells as the rows of a table. Rows of cells that stay move along with them, and so do selection
/// and current row. Without a column to sort by the cells that serve come first, then the others,
/// the strongest first.
class CellsModel : public QAbstractTableModel
{
  public:
    enum Column {
        Kind,
        System,
        Identity,
        Channel,
        Band,
        Frequency,
        Level,
        Difference,
        Quality,
        Age,
        ColumnCount,
    };

    using QAbstractTableModel::QAbstractTableModel;

    void setCells(std::vector<CellRow> cells);
    const CellRow& cell(int row) const { return _cells[static_cast<std::size_t>(row)]; }
    /// Whether some cell has something to show there; systems, whether there are several.
    bool isTelling(Column column) const;

    int rowCount(const QModelIndex& parent = {}) const override;
    int columnCount(const QModelIndex& parent = {}) const override;
    QVariant data(const QModelIndex& index, int role = Qt::DisplayRole) const override;
    QVariant headerData(int section, Qt::Orientation orientation, int role) const override;
    /// By no column where it is below 0.
    void sort(int column, Qt::SortOrder order) override;

  private:
    void removeGone(const std::vector<CellRow>& cells);
    void insertNew(const std::vector<CellRow>& cells);
    void arrange(std::vector<CellRow> cells);
    void sortCells(std::vector<CellRow>& cells) const;
    void countDigits();
    QString textOf(const CellRow& cell, Column column) const;
    QString nameOfColumn(Column column) const;

    std::vector<CellRow> _cells;
    int _sortColumn = -1;
    Qt::SortOrder _sortOrder = Qt::AscendingOrder;
    bool _isMixed = false; // of several systems
    int _digits = 0;       // behind the point, of all levels
};

} // namespace ventrik
