#include "common/ui/textfit.h"

#include <QFontMetrics>
#include <QStringList>
#include <QTextLayout>

namespace {

constexpr int kNarrowestCharacter = 2; // pixels
constexpr QChar kEllipsis(0x2026);

// At most so many characters, none of them cut in half, with an ellipsis for the rest.
QString shorten(const QString &text, int length)
{
    if (text.size() <= length)
        return text;
    const int end = text.at(length - 1).isHighSurrogate() ? length - 1 : length;
    return text.left(end) + kEllipsis;
}

// Every kind of line end as a line feed, other control characters as blanks.
QString plainLines(QString text)
{
    text.replace(QStringLiteral("\r\n"), QStringLiteral("\n"));
    for (QChar &character : text) {
        const QChar::Category category = character.category();
        if (character == QLatin1Char('\r') || category == QChar::Separator_Line ||
            category == QChar::Separator_Paragraph)
            character = QLatin1Char('\n');
        else if (category == QChar::Other_Control && character != QLatin1Char('\n'))
            character = QLatin1Char(' ');
    }
    return text;
}

// Breaks one paragraph, adding its lines until there are count of them; false when it goes on.
bool addLines(const QString &paragraph, const QFont &font, int width, int count, QStringList *lines)
{
    QTextLayout layout(paragraph, font);
    QTextOption option;
    option.setWrapMode(QTextOption::WrapAtWordBoundaryOrAnywhere);
    layout.setTextOption(option);
    layout.beginLayout();
    bool isWhole = true;
    for (;;) {
        QTextLine line = layout.createLine();
        if (!line.isValid())
            break;
        if (lines->size() == count) {
            isWhole = false;
            break;
        }
        line.setLineWidth(width);
        lines->append(paragraph.mid(line.textStart(), line.textLength()));
    }
    layout.endLayout();
    return isWhole;
}

QString fitLines(const QString &text, const QFont &font, int width, int count)
{
    const QFontMetrics metrics(font);
    const QStringList paragraphs = text.split(QLatin1Char('\n'));
    QStringList lines;
    for (int i = 0; i < paragraphs.size(); ++i) {
        const bool isWhole = addLines(paragraphs.at(i), font, width, count, &lines);
        if (isWhole && (lines.size() < count || i + 1 == paragraphs.size()))
            continue;
        // Longer than the line by what an ellipsis needs, so that it is elided in any case.
        lines.last() = metrics.elidedText(lines.last() + kEllipsis, Qt::ElideRight, width);
        break;
    }
    return lines.join(QLatin1Char('\n'));
}

} // namespace

QString fitText(const QString &text, const QFont &font, const QSize &box)
{
    const QFontMetrics metrics(font);
    int count = qMax(1, box.height() / metrics.lineSpacing());
    const QString bounded =
        plainLines(shorten(text, count * qMax(1, box.width() / kNarrowestCharacter)));
    for (;; --count) {
        const QString fitted = fitLines(bounded, font, box.width(), count);
        // Characters that come from another font make a line higher than this one's.
        const QRect needed = metrics.boundingRect(QRect(QPoint(), box), Qt::AlignLeft, fitted);
        if (count == 1 || needed.height() <= box.height())
            return fitted;
    }
}

QString buttonText(const QString &text, const QFont &font, int width)
{
    return QFontMetrics(font)
        .elidedText(text.simplified().left(width), Qt::ElideRight, width)
        .replace(QLatin1Char('&'), QStringLiteral("&&"));
}
