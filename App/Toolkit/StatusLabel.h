#pragma once

#include "App/Toolkit/ElidingLabel.h"

#include <functional>

namespace ventrik
{

/// A tool bar's status, and a note about it. The note is a second line where the bar is wide, and
/// is always told by the tool tip and to assistive technology.
class StatusLabel : public ElidingLabel
{
  public:
    /// From this width of its bar on, the label has a second line.
    static constexpr int widthForTwoLines = 480;

    enum class NoteKind {
        Lasting, ///< leaves a narrow bar as it is
        Passing, ///< there for a moment: stands in place of the status where the bar is narrow
    };

    using ElidingLabel::ElidingLabel;

    void setNote(const QString& note, NoteKind kind);
    /// A click on the label does that.
    void setAction(std::function<void()> action);
    const QString& note() const { return _note; }
    bool showsNoteBelow() const;
    bool showsNoteInstead() const;

    QSize sizeHint() const override;

  protected:
    QString tip() const override;
    Qt::TextElideMode elideMode() const override;
    bool event(QEvent* event) override;
    bool eventFilter(QObject* receiver, QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;

  private:
    void layOutAgain();

    QString _note;
    NoteKind _kind = NoteKind::Lasting;
    std::function<void()> _action;
};

} // namespace ventrik
