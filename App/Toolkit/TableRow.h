#pragma once

#include <QString>
#include <QWidget>

class QLabel;

namespace ventrik
{

class ElidingLabel;

/// What a row shows at its right edge.
enum class TableRowAccessory { None, DisclosureIndicator, CheckMark, Warning };

/// A row of a table: a content area for a text or for what a subclass puts there, an accessory, and
/// its selected look.
class TableRow : public QWidget
{
  public:
    /// How a row is set out; rows that set themselves out may have any style.
    enum class Style { Default = 0, Value = 1 };

    static constexpr int accessoryWidth = 34;
    static constexpr int rightMargin = 10; // where there is no accessory

    TableRow(Style style, QString reuseIdentifier);

    Style style() const { return _style; }
    const QString& reuseIdentifier() const { return _reuseIdentifier; }

    /// A line of text in the content area; there is none until it is asked for.
    QLabel& textLabel();
    void setText(const QString& text);

    /// The part of the row that the accessory leaves.
    QWidget& contentArea() const { return *_contentArea; }

    TableRowAccessory accessory() const { return _accessory; }
    void setAccessory(TableRowAccessory accessory);
    bool isSelected() const { return _isSelected; }
    void setSelected(bool selected);
    /// The row that the keyboard is at has a frame.
    bool hasKeyboardFrame() const { return _hasKeyboardFrame; }
    void setKeyboardFrame(bool visible);

    /// Moves what is wider than the row by so many steps to the left, or to the right where they
    /// are negative; false where there is no such thing.
    virtual bool scrollSideways(int steps);

    /// Fits the content area into the row; called whenever the row's size changes.
    virtual void layoutSubviews();

  protected:
    void resizeEvent(QResizeEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

  private:
    QColor accessoryColor() const;
    void paintAccessory(QPainter& painter) const;
    void paintWarning(QPainter& painter, const QPointF& middle) const;

    Style _style;
    QString _reuseIdentifier;
    QWidget* _contentArea;
    ElidingLabel* _textLabel = nullptr;
    TableRowAccessory _accessory = TableRowAccessory::None;
    bool _isSelected = false;
    bool _hasKeyboardFrame = false;
};

/// The frame around what the keyboard is at.
void drawKeyboardFrame(QPainter& painter, const QRect& around, const QPalette& palette);

} // namespace ventrik
