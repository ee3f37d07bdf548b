#include "App/OriginScreen.h"

#include "App/StatusItems.h"
#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/NavigationStack.h"

#include <QFontDatabase>
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

} // namespace

OriginScreen::OriginScreen(VentrikPaneHost& host, const Clock& clock, Finder find)
    : _host(host), _clock(clock), _find(std::move(find)), _text(new QPlainTextEdit(this))
{
    setTitle(QStringLiteral("Origin"));
    _text->setReadOnly(true);
    _text->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    _text->setFrameShape(QFrame::NoFrame);
    _text->setFont(fixedFont());
    _text->document()->setDocumentMargin(textMargin);
    _text->setAccessibleName(title());
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
    QString lines;
    if (!_source) {
        lines = QStringLiteral("There is no value here now.");
    } else {
        for (const auto& [name, value] : _source->lines(_clock))
            lines += QString::fromStdString(name + ": " + value + "\n");
        lines += u'\n' + QString::fromStdString(_source->packetText(bytesOfLine()));
    }
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
