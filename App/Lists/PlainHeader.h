#pragma once

#include <QHeaderView>

namespace ventrik
{

/// The names of a table's columns on its own background, small and quiet. A click sorts by a
/// column, the next one the other way round, the third by none.
class PlainHeader : public QHeaderView
{
  public:
    static constexpr int height = 28;

    explicit PlainHeader(QWidget* parent = nullptr);

    QSize sizeHint() const override;
    /// For a column's name beside the sign of its order.
    static int neededWidth(const QString& name);

  protected:
    void paintSection(QPainter* painter, const QRect& rect, int section) const override;
    void paintEvent(QPaintEvent* event) override;
};

} // namespace ventrik
