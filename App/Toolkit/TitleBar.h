#pragma once

#include <QAbstractButton>
#include <QString>
#include <QWidget>

namespace ventrik
{

/// A chevron and the title of the screen that it leads back to.
class BackButton : public QAbstractButton
{
  public:
    explicit BackButton(QWidget* parent);
    QSize sizeHint() const override;

  protected:
    void paintEvent(QPaintEvent* event) override;
};

/// The bar along the top: the title in the middle, the way back on the left.
class TitleBar : public QWidget
{
  public:
    static constexpr int barHeight = 48;

    explicit TitleBar(QWidget* parent);

    void setTitle(const QString& title);
    const QString& title() const { return _title; }
    /// Where the title is written: in the middle of the bar, or of what the way back leaves when it
    /// is too long for that.
    QRect titleRect() const;
    void showBackButton(const QString& previousTitle);
    void hideBackButton();
    BackButton& backButton() const { return *_back; }

  protected:
    void resizeEvent(QResizeEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

  private:
    void placeBackButton();

    QString _title;
    BackButton* _back;
};

} // namespace ventrik
