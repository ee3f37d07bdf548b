#pragma once

#include <QBasicTimer>
#include <QWidget>

namespace ventrik
{

/// A small grey spinner that hides itself when it is stopped. One that is started before it has a
/// parent is shown with it. It costs nothing while nobody sees it.
class ActivityIndicator : public QWidget
{
  public:
    explicit ActivityIndicator(QWidget* parent = nullptr);

    void startAnimating();
    void stopAnimating();
    bool isAnimating() const { return _isAnimating; }
    /// Animating and on the screen.
    bool isTurning() const { return _timer.isActive(); }

    QSize sizeHint() const override { return {20, 20}; }

  protected:
    void showEvent(QShowEvent* event) override;
    void hideEvent(QHideEvent* event) override;
    void timerEvent(QTimerEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

  private:
    bool _isAnimating = false;
    QBasicTimer _timer;
};

} // namespace ventrik
