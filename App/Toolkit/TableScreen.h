#pragma once

#include "App/Toolkit/Screen.h"
#include "App/Toolkit/TableView.h"

namespace ventrik
{

/// A screen that is one table, whose data source the subclass is.
class TableScreen : public Screen, public TableViewDataSource
{
  public:
    TableScreen();

    TableView& table() const { return *_table; }

    /// Loads the table for its first appearance, and takes back the selection that led to another
    /// screen.
    void viewWillAppear(bool animated) override;

  private:
    TableView* _table;
    bool _isLoaded = false;
};

} // namespace ventrik
