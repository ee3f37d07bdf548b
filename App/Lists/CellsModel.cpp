#include "App/Lists/CellsModel.h"

#include <algorithm>
#include <cmath>
#include <set>
#include <tuple>
#include <utility>

namespace ventrik
{

namespace
{

constexpr int mostDigits = 2;

bool isSameCell(const CellRow& a, const CellRow& b)
{
    return a.system == b.system && a.channel == b.channel && a.identity == b.identity;
}

bool holds(const std::vector<CellRow>& cells, const CellRow& cell)
{
    return std::ranges::any_of(cells,
                               [&](const CellRow& other) { return isSameCell(other, cell); });
}

// Each cell has one row.
void removeRepeated(std::vector<CellRow>& cells)
{
    std::vector<CellRow> kept;
    for (CellRow& cell : cells)
        if (!holds(kept, cell))
            kept.push_back(std::move(cell));
    cells = std::move(kept);
}

QString textOf(std::string_view text)
{
    return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}

const std::optional<CellLevel>& strengthOf(const CellRow& cell)
{
    return cell.level ? cell.level : cell.quality;
}

std::optional<double> numberOf(const std::optional<CellLevel>& level)
{
    return level ? std::optional(level->number) : std::nullopt;
}

// Those that serve, the others that carry something, the rest.
int rankOf(CellKind kind)
{
    if (kind == CellKind::Serving)
        return 0;
    return kind == CellKind::Secondary || kind == CellKind::Active ? 1 : 2;
}

auto usualOrderOf(const CellRow& cell)
{
    const auto strength = numberOf(strengthOf(cell));
    return std::tuple(rankOf(cell.kind), !strength, -strength.value_or(0));
}

double secondsOf(std::chrono::nanoseconds time)
{
    return std::chrono::duration<double>(time).count();
}

/// What a column of numbers is sorted by.
std::optional<double> numberIn(const CellRow& cell, CellsModel::Column column)
{
    switch (column) {
    case CellsModel::Kind:
        return static_cast<double>(cell.kind);
    case CellsModel::Channel:
        return cell.channel ? std::optional(static_cast<double>(*cell.channel)) : std::nullopt;
    case CellsModel::Frequency:
        return cell.megahertz;
    case CellsModel::Level:
        return numberOf(cell.level);
    case CellsModel::Difference:
        return cell.difference;
    case CellsModel::Quality:
        return numberOf(cell.quality);
    case CellsModel::Age:
        return secondsOf(cell.age);
    default:
        return std::nullopt;
    }
}

// Numbers within texts as numbers: 9 before 87.
QString sortedTextOf(const CellRow& cell, CellsModel::Column column)
{
    if (column == CellsModel::System)
        return textOf(nameOf(cell.system));
    const QString text = textOf(column == CellsModel::Band ? cell.band : cell.identity);
    bool isNumber = false;
    const int number = text.toInt(&isNumber);
    return isNumber ? QString::number(number).rightJustified(9, QLatin1Char('0')) : text;
}

/// Whether one comes before the other; what has nothing there comes last in either order.
bool comesBefore(const CellRow& a, const CellRow& b, CellsModel::Column column, Qt::SortOrder order)
{
    const bool isUp = order == Qt::AscendingOrder;
    const auto compared = [isUp](const auto& x, const auto& y) { return isUp ? x < y : y < x; };
    const auto first = numberIn(a, column);
    const auto second = numberIn(b, column);
    if (first || second)
        return first && (!second || compared(*first, *second));
    const QString firstText = sortedTextOf(a, column);
    const QString secondText = sortedTextOf(b, column);
    if (firstText.isEmpty() || secondText.isEmpty())
        return !firstText.isEmpty();
    return compared(firstText, secondText);
}

// So many as it has, to hundredths.
int digitsOf(const std::optional<double>& number)
{
    int digits = 0;
    for (double scaled = number.value_or(0);
         digits < mostDigits && std::abs(scaled - std::round(scaled)) > 1e-6; scaled *= 10)
        ++digits;
    return digits;
}

/// The name and the unit that the levels of all cells have; without what differs.
QString commonName(const std::vector<CellRow>& cells, std::optional<CellLevel> CellRow::*level,
                   std::string_view otherwise)
{
    std::set<std::string_view> names;
    std::set<std::string_view> units;
    for (const CellRow& cell : cells)
        if (const auto& of = cell.*level) {
            names.insert(of->name);
            units.insert(of->unit);
        }
    const QString name = textOf(names.size() == 1 ? *names.begin() : otherwise);
    return units.size() == 1 && !units.begin()->empty()
               ? name + QLatin1Char(' ') + textOf(*units.begin())
               : name;
}

} // namespace

// ---- Cells that come, go and move

void CellsModel::setCells(std::vector<CellRow> cells)
{
    removeRepeated(cells);
    sortCells(cells);
    removeGone(cells);
    insertNew(cells);
    arrange(std::move(cells));
    countDigits();
    if (!_cells.empty())
        emit dataChanged(index(0, 0), index(rowCount() - 1, ColumnCount - 1));
    emit headerDataChanged(Qt::Horizontal, 0, ColumnCount - 1);
}

void CellsModel::removeGone(const std::vector<CellRow>& cells)
{
    for (int row = rowCount() - 1; row >= 0; --row) {
        if (holds(cells, cell(row)))
            continue;
        beginRemoveRows({}, row, row);
        _cells.erase(_cells.begin() + row);
        endRemoveRows();
    }
}

void CellsModel::insertNew(const std::vector<CellRow>& cells)
{
    for (const CellRow& cell : cells) {
        if (holds(_cells, cell))
            continue;
        beginInsertRows({}, rowCount(), rowCount());
        _cells.push_back(cell);
        endInsertRows();
    }
}

// The same cells, in their new order and with their new values.
void CellsModel::arrange(std::vector<CellRow> cells)
{
    emit layoutAboutToBeChanged({}, QAbstractItemModel::VerticalSortHint);
    const std::vector<CellRow> before = std::exchange(_cells, std::move(cells));
    for (const QModelIndex& old : persistentIndexList()) {
        const CellRow& cell = before[static_cast<std::size_t>(old.row())];
        const auto now =
            std::ranges::find_if(_cells, [&](const CellRow& row) { return isSameCell(row, cell); });
        const auto row = static_cast<int>(now - _cells.begin());
        changePersistentIndex(old, now == _cells.end() ? QModelIndex() : index(row, old.column()));
    }
    emit layoutChanged({}, QAbstractItemModel::VerticalSortHint);
}

void CellsModel::sortCells(std::vector<CellRow>& cells) const
{
    std::ranges::stable_sort(cells, {}, usualOrderOf);
    if (_sortColumn < 0)
        return;
    const auto column = static_cast<Column>(_sortColumn);
    std::ranges::stable_sort(cells, [&](const CellRow& a, const CellRow& b) {
        return comesBefore(a, b, column, _sortOrder);
    });
}

void CellsModel::sort(int column, Qt::SortOrder order)
{
    _sortColumn = column < ColumnCount ? column : -1;
    _sortOrder = order;
    std::vector<CellRow> cells = _cells;
    sortCells(cells);
    arrange(std::move(cells));
}

// ---- What shows

// Numbers under each other have their points under each other.
void CellsModel::countDigits()
{
    _digits = 0;
    for (const CellRow& cell : _cells)
        for (const auto& number : {numberOf(cell.level), numberOf(cell.quality), cell.difference})
            _digits = std::max(_digits, digitsOf(number));
    _isMixed = std::ranges::any_of(
        _cells, [&](const CellRow& cell) { return cell.system != _cells.front().system; });
}

bool CellsModel::isTelling(Column column) const
{
    if (column == System)
        return _isMixed;
    return std::ranges::any_of(
        _cells, [&](const CellRow& cell) { return !textOf(cell, column).isEmpty(); });
}

QString CellsModel::textOf(const CellRow& cell, Column column) const
{
    const auto decimal = [this](const auto& number) {
        return number ? QString::number(*number, 'f', _digits) : QString();
    };
    switch (column) {
    case Kind:
        return ventrik::textOf(nameOf(cell.kind));
    case System:
        return ventrik::textOf(nameOf(cell.system));
    case Identity:
        if (cell.identity.empty())
            return {};
        return _isMixed ? ventrik::textOf(identityNameOf(cell.system)) + QLatin1Char(' ') +
                              ventrik::textOf(cell.identity)
                        : ventrik::textOf(cell.identity);
    case Channel:
        return cell.channel ? QString::number(*cell.channel) : QString();
    case Band:
        return ventrik::textOf(cell.band);
    case Frequency:
        return cell.megahertz ? QString::number(*cell.megahertz, 'f', 1) : QString();
    case Level:
        return decimal(numberOf(cell.level));
    case Difference:
        return (cell.difference.value_or(0) > 0 ? QStringLiteral("+") : QString()) +
               decimal(cell.difference);
    case Quality:
        return decimal(numberOf(cell.quality));
    case Age:
        return QString::number(std::chrono::duration_cast<std::chrono::seconds>(cell.age).count());
    case ColumnCount:
        break;
    }
    return {};
}

int CellsModel::rowCount(const QModelIndex& parent) const
{
    return parent.isValid() ? 0 : static_cast<int>(_cells.size());
}

int CellsModel::columnCount(const QModelIndex& parent) const
{
    return parent.isValid() ? 0 : ColumnCount;
}

QVariant CellsModel::data(const QModelIndex& index, int role) const
{
    if (!index.isValid())
        return {};
    const auto column = static_cast<Column>(index.column());
    const QString text = textOf(cell(index.row()), column);
    switch (role) {
    case Qt::DisplayRole:
        return text;
    case Qt::AccessibleTextRole:
        return text.isEmpty() ? text : nameOfColumn(column) + QLatin1Char(' ') + text;
    case Qt::TextAlignmentRole:
        return headerData(index.column(), Qt::Horizontal, role);
    default:
        return {};
    }
}

QVariant CellsModel::headerData(int section, Qt::Orientation orientation, int role) const
{
    if (orientation != Qt::Horizontal)
        return {};
    const auto column = static_cast<Column>(section);
    if (role == Qt::DisplayRole)
        return nameOfColumn(column);
    const bool isText = column == Kind || column == System || column == Band;
    if (role == Qt::TextAlignmentRole)
        return static_cast<int>((isText ? Qt::AlignLeft : Qt::AlignRight) | Qt::AlignVCenter);
    return {};
}

QString CellsModel::nameOfColumn(Column column) const
{
    switch (column) {
    case Kind:
        return QStringLiteral("Kind");
    case System:
        return QStringLiteral("System");
    case Identity:
        return _isMixed || _cells.empty() ? QStringLiteral("Cell")
                                          : ventrik::textOf(identityNameOf(_cells.front().system));
    case Channel:
        return QStringLiteral("Channel");
    case Band:
        return QStringLiteral("Band");
    case Frequency:
        return QStringLiteral("MHz");
    case Level:
        return commonName(_cells, &CellRow::level, "Level");
    case Difference:
        return QStringLiteral("Δ dB");
    case Quality:
        return commonName(_cells, &CellRow::quality, "Quality");
    case Age:
        return QStringLiteral("Age s");
    case ColumnCount:
        break;
    }
    return {};
}

} // namespace ventrik
