#pragma once

#include <QLabel>

namespace ventrik
{

/// A line of plain text that gives way: where it has less room than it wants, a part is left out,
/// the middle as a rule, and the tool tip says it whole.
class ElidingLabel : public QLabel
{
  public:
    explicit ElidingLabel(QWidget* parent = nullptr);

    void setElideMode(Qt::TextElideMode mode) { _elideMode = mode; }
    bool isElided() const;
    /// Fits the tool tip to a new text; to a new size or font it fits itself.
    void updateTip();
    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

  protected:
    /// What the tool tip says at the present size.
    virtual QString tip() const;
    virtual Qt::TextElideMode elideMode() const { return _elideMode; }
    /// Writes a text into a part of the label, elided where needed.
    void drawLine(QPainter& painter, const QRect& line, const QString& text) const;
    void changeEvent(QEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

  private:
    Qt::TextElideMode _elideMode = Qt::ElideMiddle;
};

} // namespace ventrik
