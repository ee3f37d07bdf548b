#pragma once

#include <QMessageBox>

namespace ventrik
{

/// A message with a title and one button, over a window that waits for it. It draws its title
/// itself and has no window frame, so that the title stands there once on every desktop and on
/// screens without a desktop. Escape closes it wherever the keyboard is.
class Alert : public QMessageBox
{
  public:
    /// Belongs to the window, and deletes itself when it is closed.
    Alert(const QString& title, const QString& message, const QString& button, QWidget* window);

    void openNow();

  protected:
    bool eventFilter(QObject* receiver, QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

  private:
    QRect titleRect() const;
};

} // namespace ventrik
