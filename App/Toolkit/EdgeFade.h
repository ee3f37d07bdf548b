#pragma once

#include <QWidget>

namespace ventrik
{

/// Lets what is cut at its parent's right edge fade into the background, so that it is seen to go
/// on; three dots stand for what is wholly out of sight. Clicks go through it.
class EdgeFade : public QWidget
{
  public:
    static constexpr int fadeWidth = 28;

    explicit EdgeFade(QWidget* parent);

    /// Takes its place at the parent's right edge.
    void layout();
    void setDots(bool visible);
    bool hasDots() const { return _hasDots; }

  protected:
    void paintEvent(QPaintEvent* event) override;

  private:
    bool _hasDots = false;
};

} // namespace ventrik
