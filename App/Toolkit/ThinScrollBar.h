#pragma once

#include <QScrollBar>

namespace ventrik
{

/// A narrow vertical scroll bar without arrows: it shows the place, and can be dragged. It takes
/// its colours from the palette.
class ThinScrollBar : public QScrollBar
{
  public:
    static constexpr int width = 8;

    explicit ThinScrollBar(QWidget* parent = nullptr);

  protected:
    void changeEvent(QEvent* event) override;

  private:
    void takeColors();
};

} // namespace ventrik
