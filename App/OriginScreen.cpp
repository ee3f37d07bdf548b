#include "App/OriginScreen.h"

#include "App/StatusItems.h"
#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/NavigationStack.h"
#include "App/Toolkit/WindowKeys.h"

#include <QClipboard>
#include <QFontDatabase>
#include <QGuiApplication>
#include <QKeyEvent>
#include <QPlainTextEdit>
#include <QScrollBar>
#include <QTextBlock>
#include <QVBoxLayout>

namespace ventrik
{

namespace
{

constexpr int textPoints = 13;
constexpr int textMargin = 8;
// Of a line of the packet: its offset, and three characters for each byte.
constexpr int charactersBeside = 6;
constexpr int charactersOfByte = 3;

QFont fixedFont()
{
    QFont font = QFontDatabase::systemFont(QFontDatabase::FixedFont);
    font.setPixelSize(textPoints);
    return font;
}

/// Without a selection all of it is copied.
class OriginText : public QPlainTextEdit
{
  public:
    using QPlainTextEdit::QPlainTextEdit;

  protected:
    void keyPressEvent(QKeyEvent* event) override
    {
        if (event->matches(QKeySequence::Copy) && !textCursor().hasSelection())
            QGuiApplication::clipboard()->setText(toPlainText());
        else
            QPlainTextEdit::keyPressEvent(event);
    }
};

} // namespace

OriginScreen::OriginScreen(VentrikPaneHost& host, const Clock& clock, Finder find)
    : _host(host), _clock(clock), _find(std::move(find)), _text(new OriginText(this))
{
    setTitle(QStringLiteral("Origin"));
    _text->setReadOnly(true);
    _text->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    _text->setFrameShape(QFrame::NoFrame);
    _text->setFont(fixedFont());
    _text->document()->setDocumentMargin(textMargin);
    _text->setAccessibleName(title());
    leaveKeysToWindow(*_text);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(_text);
    setFocusProxy(_text);
    reload();
}

std::size_t OriginScreen::bytesOfLine() const
{
    const int room = width() - 2 * textMargin;
    const int characters = room / std::max(1, _text->fontMetrics().horizontalAdvance(u'0'));
    return characters >= charactersBeside + 16 * charactersOfByte ? 16 : 8;
}

QString OriginScreen::text() const
{
    return _text->toPlainText();
}

bool OriginScreen::reload()
{
    _source = _find();
    showText();
    return true;
}

void OriginScreen::showText()
{
    const QString lines = _source ? QString::fromStdString(_source->allText(_clock, bytesOfLine()))
                                  : QStringLiteral("There is no value here now.");
    // What one reads or has selected stays as long as it says the same.
    if (lines == _text->toPlainText())
        return;
    const int scrolled = _text->verticalScrollBar()->value();
    _text->setPlainText(lines);
    _text->verticalScrollBar()->setValue(scrolled);
    markBytes();
}

void OriginScreen::markBytes()
{
    QList<QTextEdit::ExtraSelection> marks;
    QTextBlock line = _text->document()->begin();
    while (line.isValid() && !line.text().isEmpty())
        line = line.next(); // to the packet
    for (; line.isValid(); line = line.next()) {
        const auto open = static_cast<int>(line.text().indexOf(u'['));
        const auto close = static_cast<int>(line.text().indexOf(u']'));
        if (open < 0 || close < open)
            continue;
        QTextEdit::ExtraSelection mark;
        mark.cursor = QTextCursor(line);
        mark.cursor.setPosition(line.position() + open + 1);
        mark.cursor.setPosition(line.position() + close, QTextCursor::KeepAnchor);
        mark.format.setBackground(palette().highlight());
        mark.format.setForeground(palette().highlightedText());
        marks.append(mark);
    }
    _text->setExtraSelections(marks);
}

void OriginScreen::resizeEvent(QResizeEvent* event)
{
    Screen::resizeEvent(event);
    showText();
}

void OriginScreen::viewWillAppear(bool animated)
{
    Screen::viewWillAppear(animated);
    if (navigationStack())
        navigationStack()->setToolbarHidden(false);
}

void OriginScreen::setStatus(const std::string& status, bool isLoading)
{
    setToolbarItems(statusItems(status, isLoading, _host), true);
}

void OriginScreen::updateNotes()
{
    updateStatusNote(toolbar(), _host.statusNote());
}

} // namespace ventrik
