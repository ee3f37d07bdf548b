#pragma once

#include "App/Toolkit/Screen.h"
#include "App/Toolkit/TableView.h"

class QLabel;

namespace ventrik
{

/// A screen that is one table, whose data source the subclass is.
class TableScreen : public Screen, public TableViewDataSource
{
  public:
    TableScreen();

    TableView& table() const { return *_table; }

    /// What stands above the rows, in small print; nothing as a rule. Rows that are scrolled stay
    /// where they are on the screen when it comes and goes.
    void setNotice(const QString& text);
    QString notice() const;

    /// Loads the table for its first appearance, and takes back the selection that led to another
    /// screen.
    void viewWillAppear(bool animated) override;

  private:
    QLabel* _notice;
    TableView* _table;
    bool _isLoaded = false;
};

} // namespace ventrik
