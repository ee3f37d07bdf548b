#include "App/Lists/CellBar.h"

#include "App/Lists/CellsModel.h"
#include "App/Lists/ListLook.h"
#include "App/Toolkit/Fonts.h"
#include "Model/SeriesPoint.h"

#include <QPainter>

#include <algorithm>
#include <array>

namespace ventrik
{

namespace
{

constexpr int barHeight = 8;
constexpr int barGap = 8; // between bar and number
constexpr int longestBar = 200;

/// What levels of a name lie between, from none to all of a bar.
struct LevelRange {
    std::string_view name;
    double lowest;
    double highest;
};
constexpr auto levelRanges = std::to_array<LevelRange>({
    {"RSRP", -130, -60},
    {"RSCP", -120, -40},
    {"RxLev", -110, -47},
    {"Ec/Io", -24, 0},
    {"RSRQ", -20, -3},
});

/// How full a bar is, from 0 to 1. A level without a unit is such a share by itself.
double shareOf(const CellLevel& level)
{
    const auto range = std::ranges::find(levelRanges, level.name, &LevelRange::name);
    if (level.unit.empty() || range == levelRanges.end())
        return std::clamp(level.number, 0.0, 1.0);
    return std::clamp((level.number - range->lowest) / (range->highest - range->lowest), 0.0, 1.0);
}

/// Blues and an orange stay apart for all kinds of color vision, in hue and in lightness.
struct BarColors {
    QColor strong, medium, weak;
};
const BarColors onLight{{0x00, 0x72, 0xB2}, {0x56, 0xB4, 0xE9}, {0xE6, 0x9F, 0x00}};
const BarColors onDark{{0x3C, 0x8F, 0xD9}, {0xA0, 0xD4, 0xF7}, {0xF0, 0xB0, 0x30}};

QColor colorOf(double share, const QPalette& palette)
{
    const bool isDark = palette.color(QPalette::Base).lightnessF() < 0.5F;
    const BarColors& colors = isDark ? onDark : onLight;
    if (share >= 0.55)
        return colors.strong;
    return share >= 0.3 ? colors.medium : colors.weak;
}

void drawBar(QPainter& painter, const QRectF& track, const CellLevel& level,
             const QStyleOptionViewItem& option)
{
    const bool isSelected = option.state.testFlag(QStyle::State_Selected);
    const double share = shareOf(level);
    QColor empty = textColor(option);
    empty.setAlphaF(0.12F);
    painter.setPen(Qt::NoPen);
    painter.setBrush(empty);
    painter.drawRoundedRect(track, barHeight / 2.0, barHeight / 2.0);
    QRectF bar = track;
    bar.setWidth(std::max<double>(track.width() * share, barHeight));
    painter.setBrush(isSelected ? textColor(option) : colorOf(share, option.palette));
    painter.drawRoundedRect(bar, barHeight / 2.0, barHeight / 2.0);
}

/// The level that has a bar: the first of the two that the cell has.
const CellLevel* levelWithBar(const CellRow& cell, int column)
{
    if (column == CellsModel::Level)
        return cell.level ? &*cell.level : nullptr;
    return column == CellsModel::Quality && !cell.level && cell.quality ? &*cell.quality : nullptr;
}

} // namespace

int CellBar::textWidth(const QString& text, bool isBold)
{
    QFont font = listFont();
    font.setBold(isBold);
    return measured(text, font).width();
}

void CellBar::paint(QPainter* painter, const QStyleOptionViewItem& option,
                    const QModelIndex& index) const
{
    const CellRow& cell = static_cast<const CellsModel*>(index.model())->cell(index.row());
    const QString text = index.data().toString();
    const bool isSelected = option.state.testFlag(QStyle::State_Selected);
    const bool isStale = cell.age > longestHold;
    QFont font = listFont();
    font.setBold(cell.kind == CellKind::Serving);

    painter->save();
    painter->setRenderHint(QPainter::Antialiasing);
    drawListRow(*painter, option, index.column() == 0 ? listMargin : 0);
    painter->setFont(font);
    painter->setPen(isStale && !isSelected ? quietTextColor(option.palette) : textColor(option));
    const QRect area = option.rect.adjusted(listMargin, 0, -listMargin, -1);
    painter->drawText(area, index.data(Qt::TextAlignmentRole).toInt(), text);
    if (const CellLevel* level = levelWithBar(cell, index.column())) {
        const auto number = _numberWidths.find(index.column());
        const int taken = number == _numberWidths.end() ? 0 : number->second + barGap;
        const int room = area.width() - taken;
        QRectF track(area.left(), 0, std::min(room, longestBar), barHeight);
        track.moveCenter({track.center().x(), area.center().y() + 0.5});
        if (room >= barHeight)
            drawBar(*painter, track, *level, option);
    }
    painter->restore();
}

} // namespace ventrik
