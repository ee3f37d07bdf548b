#pragma once

#include <QLabel>

namespace ventrik
{

/// A line of plain text that gives way: where it has less room than it wants, its middle is left
/// out and the tool tip says it whole.
class ElidingLabel : public QLabel
{
  public:
    explicit ElidingLabel(QWidget* parent = nullptr);

    bool isElided() const;
    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

  protected:
    /// What the tool tip says at the present size.
    virtual QString tip() const;
    void updateTip();
    /// Writes a text into a part of the label, elided where needed.
    void drawLine(QPainter& painter, const QRect& line, const QString& text) const;
    void resizeEvent(QResizeEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
};

} // namespace ventrik
