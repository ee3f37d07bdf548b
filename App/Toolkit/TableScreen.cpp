#include "App/Toolkit/TableScreen.h"

#include "App/Toolkit/Fonts.h"

#include <QLabel>
#include <QScrollBar>
#include <QVBoxLayout>

#include <utility>

namespace ventrik
{

namespace
{

constexpr int noticePoints = 12;
constexpr QMargins noticeMargins(10, 6, 10, 6);

// Takes as many lines as it needs at the width that there is.
QLabel* makeNotice(QWidget* parent)
{
    QLabel* notice = makeLabel(systemFont(noticePoints, FontWeight::Regular), parent);
    notice->setContentsMargins(noticeMargins);
    notice->setWordWrap(true);
    notice->hide();
    return notice;
}

} // namespace

TableScreen::TableScreen() : _notice(makeNotice(this)), _table(new TableView(*this, this))
{
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    layout->addWidget(_notice);
    layout->addWidget(_table);
    setFocusProxy(_table);
}

void TableScreen::setNotice(const QString& text)
{
    if (text == notice())
        return;
    QScrollBar& bar = *_table->verticalScrollBar();
    const int formerValue = bar.value();
    const int formerTop = _table->y();
    _notice->setText(text);
    _notice->setVisible(!text.isEmpty());
    layout()->activate();
    if (formerValue > 0)
        bar.setValue(formerValue + _table->y() - formerTop);
}

QString TableScreen::notice() const
{
    return _notice->text();
}

void TableScreen::viewWillAppear(bool)
{
    if (!std::exchange(_isLoaded, true))
        _table->reloadData();
    if (const auto selected = _table->indexPathForSelectedRow())
        _table->deselectRow(*selected);
}

} // namespace ventrik
