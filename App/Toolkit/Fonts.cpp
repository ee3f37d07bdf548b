#include "App/Toolkit/Fonts.h"

#include <QFontMetrics>
#include <QGuiApplication>
#include <QLabel>

namespace ventrik
{

QFont systemFont(int points, FontWeight weight)
{
    QFont font = QGuiApplication::font();
    font.setPixelSize(points);
    font.setBold(weight == FontWeight::Bold);
    return font;
}

QSize measured(const QString& text, const QFont& font)
{
    return QFontMetrics(font).size(Qt::TextSingleLine, text);
}

QLabel* makeLabel(const QFont& font, QWidget* parent)
{
    auto* label = new QLabel(parent);
    label->setTextFormat(Qt::PlainText);
    label->setFont(font);
    label->setAlignment(Qt::AlignLeft | Qt::AlignTop);
    return label;
}

} // namespace ventrik
