#include "App/VentrikPaneController.h"

#include "App/StatusItems.h"
#include "App/Toolkit/HorizontalScrollView.h"
#include "App/Toolkit/NavigationStack.h"
#include "App/Toolkit/PlainText.h"
#include "App/Toolkit/PushButton.h"
#include "App/VentrikCell.h"
#include "Model/NodeRows.h"

#include <utility>

namespace ventrik
{

namespace
{

constexpr auto rowStyle = TableRow::Style::Value;

QString identifier()
{
    return QStringLiteral("VentrikPaneControllerCell");
}

std::unique_ptr<QWidget> makeSaveButton(VentrikPaneHost& host)
{
    auto button = std::make_unique<PushButton>(QStringLiteral("Save"));
    button->setShortcut(QKeySequence::Save);
    QObject::connect(button.get(), &QPushButton::clicked, button.get(),
                     [&host] { host.showSaveView(); });
    return button;
}

// Its key is that of the whole window.
std::unique_ptr<QWidget> makeTimeLineButton(VentrikPaneHost& host)
{
    auto button = std::make_unique<PushButton>(QStringLiteral("Time Line"));
    QObject::connect(button.get(), &QPushButton::clicked, button.get(),
                     [&host] { host.toggleTimeLine(); });
    return button;
}

// Where the rows of one node are in another one.
TableView::RowMapping mappingBetween(const ModelNodePointer& from, const ModelNodePointer& to)
{
    return [from, to](int row) -> std::optional<int> {
        const auto& former = rowsOf(from);
        const auto place = static_cast<std::size_t>(row);
        if (place >= former.size())
            return std::nullopt;
        return nearestNamed(rowsOf(to), former[place]->displayName(), row);
    };
}

// Rows of both kinds share one identifier, so that a row may come back with the other structure.
std::unique_ptr<VentrikCell> dequeueCell(TableView& table)
{
    // Everything under the identifier was made here.
    return std::unique_ptr<VentrikCell>(
        static_cast<VentrikCell*>(table.dequeueReusableRow(identifier()).release()));
}

std::unique_ptr<VentrikCell> innerRow(TableView& table, const VentrikModelNode& node)
{
    auto cell = dequeueCell(table);
    if (!cell)
        cell = VentrikCell::initWithStyleKey(rowStyle, identifier());
    cell->setKeyText(QString::fromStdString(node.displayName()));
    cell->setDoubt(QString());
    cell->setAccessory(TableRowAccessory::DisclosureIndicator);
    cell->setValueText(QString());
    cell->setLayoutKey();
    return cell;
}

std::unique_ptr<VentrikCell> leafRow(TableView& table, const VentrikModelNode& node,
                                     const QString& doubt)
{
    auto cell = dequeueCell(table);
    if (!cell)
        cell = VentrikCell::initWithStyle(rowStyle, identifier());
    cell->setKeyText(QString::fromStdString(node.displayName()));
    cell->setDoubt(doubt);
    cell->setAccessory(cell->isInDoubt() ? TableRowAccessory::Warning : TableRowAccessory::None);
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
    std::vector<ToolBarItem> items = statusItems(_status, _isLoading, _host);
    if (_host.offersTimeLine())
        items.push_back(ToolBarItem::widget(makeTimeLineButton(_host)));
    if (_host.allowSaveButton())
        items.push_back(ToolBarItem::widget(makeSaveButton(_host)));
    setToolbarItems(std::move(items), true);
    table().setPlaceholder(reasonForNoRows());
}

void VentrikPaneController::updateNotes()
{
    updateStatusNote(toolbar(), _host.statusNote());
    updateStaleness();
    table().setPlaceholder(reasonForNoRows());
}

QString VentrikPaneController::reasonForNoRows() const
{
    return _nodes && _nodes->childNodes() ? QStringLiteral("This list is empty")
                                          : QString::fromStdString(_host.reasonForNoData());
}

void VentrikPaneController::setStatus(const std::string& status, bool isLoading)
{
    _status = status;
    _isLoading = isLoading;
    createToolbarItems();
}

bool VentrikPaneController::reload()
{
    ModelNodePointer node = isRoot() ? _host.topLevelNodes() : _host.nodeAtPath(_keyPath);
    const bool isThere = isRoot() || node;
    if (isThere || _host.showsPast())
        reloadWithNode(std::move(node));
    return isThere || _host.showsPast();
}

void VentrikPaneController::reloadWithNode(ModelNodePointer node)
{
    _formerNodes = std::exchange(_nodes, std::move(node));
    updateTitle();
    table().reloadData(mappingBetween(_formerNodes, _nodes));
    _formerNodes = nullptr;
    updateLayoutWarnings();
    createToolbarItems();
}

void VentrikPaneController::updateTitle()
{
    if (_nodes || isRoot() || title().isEmpty())
        setTitle(_nodes ? QString::fromStdString(_nodes->displayName())
                        : QStringLiteral("Ventrik"));
}

void VentrikPaneController::updateLayoutWarnings()
{
    QStringList lines;
    for (const std::string& line : _host.layoutWarningsAt(_keyPath))
        lines.append(QString::fromStdString(line));
    setNotice(lines.join(u'\n'));
}

// Values grow old while nothing comes.
void VentrikPaneController::updateStaleness()
{
    table().forEachRowInView([this](int row, TableRow& cell) {
        const VentrikModelNode& child = *childAt({0, row});
        static_cast<VentrikCell&>(cell).setFaint(child.value() && _host.isStale(pathOf(child)));
    });
}

std::string VentrikPaneController::pathOf(const VentrikModelNode& child) const
{
    return pathJoining(_keyPath, child.displayName());
}

QString VentrikPaneController::doubtOf(const VentrikModelNode& leaf) const
{
    const std::string_view doubt = _host.doubtAt(pathOf(leaf));
    return QString::fromUtf8(doubt.data(), static_cast<qsizetype>(doubt.size()));
}

void VentrikPaneController::viewWillAppear(bool animated)
{
    TableScreen::viewWillAppear(animated);
    updateTitle();
    updateLayoutWarnings();
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
    return rowsOf(_nodes);
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
    auto cell = child.childNodes() ? innerRow(table, child) : leafRow(table, child, doubtOf(child));
    if (HorizontalScrollView* view = cell->view()) {
        const auto offset = _contentOffsets.find(cell->key().text());
        view->setContentOffset(offset == _contentOffsets.end() ? 0 : offset->second);
    }
    const std::string path = pathOf(child);
    cell->setFaint(child.value() && _host.isStale(path));
    cell->setTipSource([&host = _host, path, isLeaf = child.value() != nullptr] {
        return isLeaf ? plainToolTip(QString::fromStdString(host.briefSourceOf(path))) : QString();
    });
    if (_host.tintsChanges() && hasChanged(rowsOf(_formerNodes), child, indexPath.row))
        cell->tintValue();
    return cell;
}

void VentrikPaneController::rowWillBeReused(TableRow& row)
{
    const auto& cell = static_cast<VentrikCell&>(row);
    if (!cell.view())
        return;
    if (cell.view()->contentOffset() > 0)
        _contentOffsets[cell.key().text()] = cell.view()->contentOffset();
    else
        _contentOffsets.erase(cell.key().text());
}

QString VentrikPaneController::textForCopying(IndexPath indexPath)
{
    const VentrikModelNode& child = *childAt(indexPath);
    const std::string text =
        child.value() ? child.displayName() + ": " + *child.value() : child.displayName();
    return QString::fromStdString(text);
}

std::vector<RowAction> VentrikPaneController::actionsForRow(IndexPath indexPath)
{
    const VentrikModelNode& child = *childAt(indexPath);
    const std::string path = pathOf(child);
    std::vector<RowAction> actions;
    if (child.value() && !_host.briefSourceOf(path).empty())
        actions.push_back({QStringLiteral("Where It Comes From"),
                           QKeySequence(Qt::CTRL | Qt::Key_I),
                           [this, path] { _host.showSourceOf(path); }});
    if (child.value() && _host.canPin(path))
        actions.push_back({_host.isPinned(path) ? QStringLiteral("Unpin from the Time Line")
                                                : QStringLiteral("Pin to the Time Line"),
                           QKeySequence(Qt::Key_P), [this, path] { _host.togglePin(path); }});
    return actions;
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
    auto pane = initWithNode(_host, child, pathOf(*child));
    pane->setStatus(_status, _isLoading);
    navigationStack()->push(std::move(pane), true);
}

} // namespace ventrik
