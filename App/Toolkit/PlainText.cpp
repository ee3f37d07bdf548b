#include "App/Toolkit/PlainText.h"

#include <QTextDocument>

namespace ventrik
{

namespace
{

bool breaksTheLine(QChar character)
{
    return character.category() == QChar::Other_Control ||
           character.category() == QChar::Separator_Line ||
           character.category() == QChar::Separator_Paragraph;
}

} // namespace

QString oneLine(QString text)
{
    for (QChar& character : text)
        if (breaksTheLine(character))
            character = u' ';
    return text;
}

// A tool tip guesses for itself whether its text is markup.
QString plainToolTip(const QString& text)
{
    return Qt::mightBeRichText(text) ? Qt::convertFromPlainText(text, Qt::WhiteSpaceNormal) : text;
}

} // namespace ventrik
