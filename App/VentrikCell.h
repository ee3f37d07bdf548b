#pragma once

#include "App/Toolkit/TableRow.h"

#include <QBasicTimer>

#include <functional>
#include <memory>

class QLabel;

namespace ventrik
{

class EdgeFade;
class HorizontalScrollView;

/// A row of a pane: a bold name on the left and, for a leaf, its value beside it, to be moved
/// sideways where it does not fit. A row keeps the structure it was made with, also when it is used
/// again for a node of the other kind. A value that has just changed is tinted for a moment.
class VentrikCell : public TableRow
{
  public:
    /// A row for an inner node: the key alone.
    static std::unique_ptr<VentrikCell> initWithStyleKey(Style style, const QString& identifier);
    /// A row for a leaf: the key and the value in a scroll view.
    static std::unique_ptr<VentrikCell> initWithStyle(Style style, const QString& identifier);

    QLabel& key() const { return *_key; }
    /// Null in a row made for an inner node, as is the view.
    QLabel* value() const { return _value; }
    HorizontalScrollView* view() const { return _view; }

    void setKeyText(const QString& text);
    /// Does nothing in a row that has no value.
    void setValueText(const QString& text);
    /// What is wrong with the value, told by the tool tip and to assistive technology; empty when
    /// nothing is. Does nothing in a row that has no value.
    void setDoubt(const QString& line);
    /// What the tool tip says besides, asked for when it opens; nothing where it is empty.
    void setTipSource(std::function<QString()> source) { _tipSource = std::move(source); }
    /// A value that was not told for long is a little fainter.
    void setFaint(bool isFaint);
    bool isFaint() const { return _isFaint; }
    bool isInDoubt() const { return _value && !accessibleDescription().isEmpty(); }
    /// Tints the value for a moment, unless the platform asks for less motion.
    void tintValue();
    /// Whether what goes on beyond the right edge fades there.
    bool isFading() const;
    /// Whether dots stand there for a value that is out of sight.
    bool showsDots() const;
    bool isTinted() const { return _tintTimer.isActive(); }

    /// Lays out the key alone, or both; the row keeps to it when its size changes.
    void setLayoutKey();
    void setLayout();

    bool scrollSideways(int steps) override;
    void layoutSubviews() override;

  protected:
    bool event(QEvent* event) override;
    void changeEvent(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void timerEvent(QTimerEvent* event) override;

  private:
    enum class Layout { None, Key, KeyAndValue };

    VentrikCell(Style style, const QString& identifier);

    void colorValue();
    void placeKey();
    void placeValue();
    int roomAroundKey() const;
    int placeInRow(const QLabel& label, int x) const;
    void updateFade();
    void endTint();
    void updateAccessibleName();

    QLabel* _key = nullptr;
    QLabel* _value = nullptr;
    HorizontalScrollView* _view = nullptr;
    EdgeFade* _fade;
    Layout _layout = Layout::None;
    QBasicTimer _tintTimer;
    std::function<QString()> _tipSource;
    bool _isFaint = false;
};

} // namespace ventrik
