#pragma once

#include <QPointer>
#include <QWidget>

#include <functional>

class QHBoxLayout;

namespace ventrik
{

/// The window: the panes, and beside them, where there is room and somebody wants it, the time
/// line.
class ViewerWindow : public QWidget
{
  public:
    /// From this width on the time line has room beside the panes, which are then a phone's width.
    static constexpr int wideWidth = 840;
    static constexpr int paneWidth = 390;

    ViewerWindow();

    /// The window owns both from then on; they come in this order.
    void addPanes(QWidget* panes);
    void addTimeLine(QWidget* timeLine);
    void setTimeLineWanted(bool isWanted);
    bool isTimeLineWanted() const { return _isTimeLineWanted; }
    bool isWide() const { return width() >= wideWidth; }
    /// Whether the time line stands beside the panes.
    bool showsTimeLine() const { return isWide() && _isTimeLineWanted; }
    /// Takes the time line back from whoever had borrowed it.
    void takeBackTimeLine();

    /// Called where the window has become wide or narrow.
    void setWidthCallback(std::function<void()> changed) { _widthChanged = std::move(changed); }
    /// Called for the space bar, where nobody else used it.
    void setSpaceCallback(std::function<void()> pressed) { _spacePressed = std::move(pressed); }

  protected:
    void resizeEvent(QResizeEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;

  private:
    void layOut();

    QHBoxLayout* _layout;
    QPointer<QWidget> _panes;
    QPointer<QWidget> _timeLine;
    QWidget* _separator;
    bool _isTimeLineWanted = false;
    bool _wasWide = false;
    std::function<void()> _widthChanged;
    std::function<void()> _spacePressed;
};

} // namespace ventrik
