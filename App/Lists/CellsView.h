#pragma once

#include "Model/CellTable.h"

#include <QWidget>

#include <functional>
#include <string>
#include <vector>

class QTableView;

namespace ventrik
{

class CellBar;
class CellsModel;

/// A list of cells, side by side with their levels. A click or Enter opens a cell's pane; a click
/// on a column's name sorts by it. Where there is little room, only the columns that say most show.
class CellsView : public QWidget
{
  public:
    explicit CellsView(QWidget* parent = nullptr);
    ~CellsView() override;

    /// Selection and scroll position stay with their cells.
    void setCells(std::vector<CellRow> cells);
    /// Called with the path of the pane to open.
    void setOnOpen(std::function<void(const std::string& path)> onOpen);

    QTableView& table() const;
    const CellsModel& model() const { return *_model; }

  private:
    class Table;

    void open(int row) const;

    CellsModel* _model;
    Table* _table;
    std::function<void(const std::string&)> _onOpen;
};

} // namespace ventrik
