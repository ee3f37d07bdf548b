#pragma once

#include <QStyledItemDelegate>

#include <map>

namespace ventrik
{

/// Draws the cells of a CellsModel. Beside a level stands a bar: its length says how strong, and so
/// does its color, for those as well who tell few of them apart. What has not been told for long is
/// quieter; serving cells are bold.
class CellBar : public QStyledItemDelegate
{
  public:
    /// A column with bars has room for one of that length, and the gap beside it.
    static constexpr int shortestBar = 32;

    using QStyledItemDelegate::QStyledItemDelegate;

    static int textWidth(const QString& text, bool isBold);
    /// Of the widest number of each column with a bar: all its bars are of one length.
    void setNumberWidth(int column, int width) { _numberWidths[column] = width; }

    void paint(QPainter* painter, const QStyleOptionViewItem& option,
               const QModelIndex& index) const override;

  private:
    std::map<int, int> _numberWidths;
};

} // namespace ventrik
