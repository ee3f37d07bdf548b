#include "App/Lists/CellsView.h"

#include "App/Lists/CellBar.h"
#include "App/Lists/CellsModel.h"
#include "App/Lists/ListLook.h"
#include "App/Lists/PlainHeader.h"

#include <QClipboard>
#include <QGuiApplication>
#include <QKeyEvent>
#include <QPainter>
#include <QTableView>
#include <QVBoxLayout>

#include <algorithm>
#include <array>
#include <numeric>
#include <utility>

namespace ventrik
{

namespace
{

// Where there is not room for all, the last ones go first.
constexpr std::array<CellsModel::Column, CellsModel::ColumnCount> byImportance{
    CellsModel::Kind,       CellsModel::Identity, CellsModel::Level, CellsModel::Channel,
    CellsModel::Difference, CellsModel::Quality,  CellsModel::Band,  CellsModel::Frequency,
    CellsModel::Age,        CellsModel::System,
};
constexpr std::size_t alwaysShown = 3;
constexpr int widestBarColumn = 280;

} // namespace

/// The table itself: fits its columns into its width, and opens and copies rows by keys.
class CellsView::Table : public QTableView
{
  public:
    Table(CellsModel& model, QWidget* parent) : QTableView(parent), _model(model)
    {
        makePlain(*this);
        setHorizontalHeader(new PlainHeader(this));
        setModel(&model);
        setItemDelegate(_bars);
        setSortingEnabled(true);
        setShowGrid(false);
        setWordWrap(false);
        verticalHeader()->hide();
        verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
        verticalHeader()->setDefaultSectionSize(listRowHeight);
        horizontalHeader()->setSectionResizeMode(QHeaderView::Fixed);
        setAccessibleName(QStringLiteral("Cells"));
    }

    void setOnOpen(std::function<void(int row)> onOpen) { _onOpen = std::move(onOpen); }
    void fitColumns();

  protected:
    void keyPressEvent(QKeyEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

  private:
    using Widths = std::array<int, CellsModel::ColumnCount>;

    int widestText(CellsModel::Column column) const;
    bool hasBars(CellsModel::Column column) const;
    int neededWidth(CellsModel::Column column);
    Widths shownWidths();
    void spread(Widths& widths) const;
    void copyRow(int row) const;

    CellsModel& _model;
    CellBar* _bars = new CellBar(this);
    std::function<void(int)> _onOpen;
};

int CellsView::Table::widestText(CellsModel::Column column) const
{
    int width = 0;
    for (int row = 0; row < _model.rowCount(); ++row)
        width = std::max(width, CellBar::textWidth(_model.index(row, column).data().toString(),
                                                   _model.cell(row).kind == CellKind::Serving));
    return width;
}

bool CellsView::Table::hasBars(CellsModel::Column column) const
{
    const bool isLevel = _model.isTelling(CellsModel::Level);
    return column == (isLevel ? CellsModel::Level : CellsModel::Quality);
}

int CellsView::Table::neededWidth(CellsModel::Column column)
{
    const int texts = widestText(column);
    const QString name = _model.headerData(column, Qt::Horizontal, Qt::DisplayRole).toString();
    _bars->setNumberWidth(column, texts);
    const int content = texts + (hasBars(column) ? CellBar::shortestBar : 0);
    return std::max(content, PlainHeader::neededWidth(name)) + 2 * listMargin;
}

// A column that says nothing shows only where there is no cell at all.
CellsView::Table::Widths CellsView::Table::shownWidths()
{
    Widths widths{};
    int room = viewport()->width();
    for (std::size_t i = 0; i < byImportance.size(); ++i) {
        const CellsModel::Column column = byImportance[i];
        if (!_model.isTelling(column))
            continue;
        const int needed = neededWidth(column);
        if (i >= alwaysShown && needed > room)
            continue;
        widths[column] = needed;
        room -= needed;
    }
    return widths;
}

// What is left makes the bars longer, then the columns wider.
void CellsView::Table::spread(Widths& widths) const
{
    int room = viewport()->width() - std::accumulate(widths.begin(), widths.end(), 0);
    const auto columns = std::ranges::count_if(widths, [](int width) { return width > 0; });
    if (room <= 0 || columns == 0)
        return;
    for (const auto column : {CellsModel::Level, CellsModel::Quality})
        if (hasBars(column) && widths[column] > 0) {
            const int more = std::clamp(widestBarColumn - widths[column], 0, room);
            widths[column] += more;
            room -= more;
        }
    const int each = room / static_cast<int>(columns);
    for (int& width : widths)
        width += width > 0 ? each : 0;
    // The last one ends at the edge.
    const auto last = std::find_if(widths.rbegin(), widths.rend(), [](int w) { return w > 0; });
    *last += room - each * static_cast<int>(columns);
}

void CellsView::Table::fitColumns()
{
    Widths widths = shownWidths();
    spread(widths);
    for (std::size_t column = 0; column < widths.size(); ++column) {
        setColumnHidden(static_cast<int>(column), widths[column] == 0);
        if (widths[column] > 0)
            setColumnWidth(static_cast<int>(column), widths[column]);
    }
    horizontalHeader()->setVisible(_model.rowCount() > 0);
}

void CellsView::Table::keyPressEvent(QKeyEvent* event)
{
    const int row = currentIndex().row();
    const bool isEnter = event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter;
    if (row >= 0 && isEnter && _onOpen)
        _onOpen(row);
    else if (row >= 0 && event->matches(QKeySequence::Copy))
        copyRow(row);
    else
        QTableView::keyPressEvent(event);
}

// As a line of a table: programs for tables take it as it is.
void CellsView::Table::copyRow(int row) const
{
    QStringList texts;
    for (int column = 0; column < CellsModel::ColumnCount; ++column)
        if (_model.isTelling(static_cast<CellsModel::Column>(column)))
            texts.append(_model.index(row, column).data().toString());
    QGuiApplication::clipboard()->setText(texts.join(QLatin1Char('\t')));
}

void CellsView::Table::resizeEvent(QResizeEvent* event)
{
    QTableView::resizeEvent(event);
    fitColumns();
}

void CellsView::Table::paintEvent(QPaintEvent* event)
{
    QTableView::paintEvent(event);
    if (_model.rowCount() > 0)
        return;
    QPainter painter(viewport());
    drawPlaceholder(painter, viewport()->rect(), palette(), QStringLiteral("No cells yet"));
}

CellsView::CellsView(QWidget* parent)
    : QWidget(parent), _model(new CellsModel(this)), _table(new Table(*_model, this))
{
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(_table);
    setFocusProxy(_table);
    _table->setOnOpen([this](int row) { open(row); });
    connect(_table, &QTableView::clicked, this,
            [this](const QModelIndex& index) { open(index.row()); });
}

CellsView::~CellsView() = default;

void CellsView::setCells(std::vector<CellRow> cells)
{
    _model->setCells(std::move(cells));
    _table->fitColumns();
}

void CellsView::setOnOpen(std::function<void(const std::string& path)> onOpen)
{
    _onOpen = std::move(onOpen);
}

QTableView& CellsView::table() const
{
    return *_table;
}

void CellsView::open(int row) const
{
    // The callback may bring other cells.
    const std::string path = _model->cell(row).path;
    if (_onOpen)
        _onOpen(path);
}

} // namespace ventrik
