#include "App/VentrikPaneController.h"

#include "App/Toolkit/ActivityIndicator.h"
#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/NavigationStack.h"
#include "App/VentrikCell.h"

#include <QLabel>
#include <QPushButton>

namespace ventrik
{

namespace
{

constexpr int statusPoints = 14;
constexpr auto rowStyle = TableRow::Style::Value;

QString identifier()
{
    return QStringLiteral("VentrikPaneControllerCell");
}

std::unique_ptr<QWidget> makeIndicator(bool isLoading)
{
    auto indicator = std::make_unique<ActivityIndicator>();
    if (isLoading)
        indicator->startAnimating();
    else
        indicator->stopAnimating();
    return indicator;
}

std::unique_ptr<QWidget> makeStatusLabel(const std::string& status)
{
    std::unique_ptr<QLabel> label(
        makeLabel(systemFont(statusPoints, FontWeight::Regular), nullptr));
    label->setText(QString::fromStdString(status));
    label->setFixedSize(label->sizeHint());
    return label;
}

std::unique_ptr<QWidget> makeSaveButton(VentrikPaneHost& host)
{
    auto button = std::make_unique<QPushButton>(QStringLiteral("Save"));
    QObject::connect(button.get(), &QPushButton::clicked, button.get(),
                     [&host] { host.showSaveView(); });
    return button;
}

// Rows of both kinds share one identifier, so that a row may come back with the other structure.
std::unique_ptr<VentrikCell> dequeueCell(TableView& table)
{
    // Everything under the identifier was made here.
    return std::unique_ptr<VentrikCell>(
        static_cast<VentrikCell*>(table.dequeueReusableRow(identifier()).release()));
}

std::unique_ptr<TableRow> innerRow(TableView& table, const VentrikModelNode& node)
{
    auto cell = dequeueCell(table);
    if (!cell)
        cell = VentrikCell::initWithStyleKey(rowStyle, identifier());
    cell->setKeyText(QString::fromStdString(node.displayName()));
    cell->setAccessory(TableRowAccessory::DisclosureIndicator);
    cell->setValueText(QString());
    cell->setLayoutKey();
    return cell;
}

std::unique_ptr<TableRow> leafRow(TableView& table, const VentrikModelNode& node)
{
    auto cell = dequeueCell(table);
    if (!cell)
        cell = VentrikCell::initWithStyle(rowStyle, identifier());
    cell->setKeyText(QString::fromStdString(node.displayName()));
    cell->setAccessory(TableRowAccessory::None);
    cell->setValueText(QString::fromStdString(*node.value()));
    cell->setLayout();
    return cell;
}

} // namespace

VentrikPaneController::VentrikPaneController(VentrikPaneHost& host, ModelNodePointer node,
                                             std::string path)
    : _host(host), _nodes(std::move(node)), _keyPath(std::move(path))
{
}

std::unique_ptr<VentrikPaneController>
VentrikPaneController::initWithNode(VentrikPaneHost& host, ModelNodePointer node, std::string path)
{
    return std::unique_ptr<VentrikPaneController>(
        new VentrikPaneController(host, std::move(node), std::move(path)));
}

void VentrikPaneController::createToolbarItems()
{
    std::vector<ToolBarItem> items;
    items.push_back(ToolBarItem::widget(makeIndicator(_isLoading)));
    items.push_back(ToolBarItem::widget(makeStatusLabel(_status)));
    items.push_back(ToolBarItem::flexibleSpace());
    if (_host.allowSaveButton())
        items.push_back(ToolBarItem::widget(makeSaveButton(_host)));
    setToolbarItems(std::move(items), true);
}

void VentrikPaneController::setStatus(const std::string& status, bool isLoading)
{
    _status = status;
    _isLoading = isLoading;
    createToolbarItems();
}

void VentrikPaneController::reloadWithNode(ModelNodePointer node)
{
    _nodes = std::move(node);
    updateTitle();
    table().reloadData();
    createToolbarItems();
}

void VentrikPaneController::updateTitle()
{
    setTitle(_nodes ? QString::fromStdString(_nodes->displayName()) : QStringLiteral("Ventrik"));
}

void VentrikPaneController::viewWillAppear(bool animated)
{
    TableScreen::viewWillAppear(animated);
    updateTitle();
    if (navigationStack())
        navigationStack()->setToolbarHidden(false);
    createToolbarItems();
}

// The base class is left out on purpose: nothing else happens to a pane that goes.
void VentrikPaneController::viewWillDisappear(bool)
{
    table().clearFocus();
}

const VentrikModelNode::Children& VentrikPaneController::children() const
{
    static const VentrikModelNode::Children none;
    const auto* childNodes = _nodes ? _nodes->childNodes() : nullptr;
    return childNodes ? *childNodes : none;
}

const ModelNodePointer& VentrikPaneController::childAt(IndexPath indexPath) const
{
    return children().at(static_cast<std::size_t>(indexPath.row));
}

int VentrikPaneController::rowsInSection(int)
{
    return static_cast<int>(children().size());
}

std::unique_ptr<TableRow> VentrikPaneController::rowForIndexPath(TableView& table,
                                                                 IndexPath indexPath)
{
    const VentrikModelNode& child = *childAt(indexPath);
    return child.childNodes() ? innerRow(table, child) : leafRow(table, child);
}

void VentrikPaneController::rowSelected(TableView& table, std::optional<IndexPath> indexPath)
{
    if (!indexPath)
        return;
    const ModelNodePointer child = childAt(*indexPath);
    if (!child->childNodes()) {
        table.deselectRow(*indexPath);
        return;
    }
    auto pane = initWithNode(_host, child, pathJoining(_keyPath, child->displayName()));
    pane->setStatus(_status, _isLoading);
    navigationStack()->push(std::move(pane), true);
}

} // namespace ventrik
