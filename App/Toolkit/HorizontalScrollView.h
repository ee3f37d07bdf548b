#pragma once

#include <QPoint>
#include <QSize>
#include <QWidget>

#include <functional>

namespace ventrik
{

/// A window on content that may be wider than it: moved sideways by a drag, a touch or a sideways
/// wheel. What it does not use goes on to the widgets below.
class HorizontalScrollView : public QWidget
{
  public:
    explicit HorizontalScrollView(QWidget* parent = nullptr);

    /// The parent for what is shown.
    QWidget& content() const { return *_content; }
    QSize contentSize() const { return _content->size(); }
    void setContentSize(const QSize& size);

    /// How far the content is moved to the left, kept within what there is to see.
    int contentOffset() const { return -_content->x(); }
    void setContentOffset(int offset);
    /// Called after each change of the offset.
    void setScrolled(std::function<void()> scrolled) { _scrolled = std::move(scrolled); }

  protected:
    bool event(QEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;

  private:
    int largestOffset() const;

    QWidget* _content;
    std::function<void()> _scrolled;
    QPoint _pressPosition;
    int _pressOffset = 0;
};

} // namespace ventrik
