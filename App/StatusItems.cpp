#include "App/StatusItems.h"

#include "App/StatusNote.h"
#include "App/Toolkit/ActivityIndicator.h"
#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/PlainText.h"
#include "App/Toolkit/StatusLabel.h"
#include "App/VentrikPaneController.h"

namespace ventrik
{

namespace
{

constexpr int statusPoints = 14;

std::unique_ptr<QWidget> makeIndicator(bool isLoading)
{
    auto indicator = std::make_unique<ActivityIndicator>();
    if (isLoading)
        indicator->startAnimating();
    else
        indicator->stopAnimating();
    return indicator;
}

void showNote(const StatusNote& note, StatusLabel& label)
{
    label.setNote(oneLine(QString::fromStdString(note.text)), note.kind);
}

std::unique_ptr<QWidget> makeStatusLabel(const std::string& status, VentrikPaneHost& host)
{
    auto label = std::make_unique<StatusLabel>();
    label->setFont(systemFont(statusPoints, FontWeight::Regular));
    label->setText(QString::fromStdString(status));
    showNote(host.statusNote(), *label);
    if (host.showsPast())
        label->setAction([&host] { host.goLive(); });
    label->resize(label->sizeHint());
    return label;
}

} // namespace

std::vector<ToolBarItem> statusItems(const std::string& status, bool isLoading,
                                     VentrikPaneHost& host)
{
    std::vector<ToolBarItem> items;
    items.push_back(ToolBarItem::widget(makeIndicator(isLoading)));
    items.push_back(ToolBarItem::widget(makeStatusLabel(status, host)));
    items.push_back(ToolBarItem::flexibleSpace());
    return items;
}

void updateStatusNote(const ToolBar& toolbar, const StatusNote& note)
{
    for (QWidget* item : toolbar.items())
        if (auto* label = dynamic_cast<StatusLabel*>(item))
            showNote(note, *label);
}

} // namespace ventrik
