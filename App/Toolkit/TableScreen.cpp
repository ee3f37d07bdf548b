#include "App/Toolkit/TableScreen.h"

#include <QVBoxLayout>

#include <utility>

namespace ventrik
{

TableScreen::TableScreen() : _table(new TableView(*this, this))
{
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(_table);
    setFocusProxy(_table);
}

void TableScreen::viewWillAppear(bool)
{
    if (!std::exchange(_isLoaded, true))
        _table->reloadData();
    if (const auto selected = _table->indexPathForSelectedRow())
        _table->deselectRow(*selected);
}

} // namespace ventrik
