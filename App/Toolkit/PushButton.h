#pragma once

#include <QPushButton>

namespace ventrik
{

/// A button for a finger that the keyboard can reach and is seen at. In a narrow window it gives
/// way down to its text.
class PushButton : public QPushButton
{
  public:
    explicit PushButton(QWidget* parent = nullptr);
    explicit PushButton(const QString& text, QWidget* parent = nullptr);

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

  protected:
    void paintEvent(QPaintEvent* event) override;

  private:
    int widthWith(int besideText) const;
};

} // namespace ventrik
