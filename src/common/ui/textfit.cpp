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

// Breaks text into lines until they fill the height; each is as high as its highest characters,
// which may come from another font.
class LineBreaker
{
public:
    LineBreaker(const QFont &font, const QSize &box)
        : mFont(font)
        , mMetrics(font)
        , mBox(box)
    {
    }

    // False when the paragraph did not fit, or only a part of it.
    bool add(const QString &paragraph)
    {
        QTextLayout layout(paragraph, mFont);
        QTextOption option;
        option.setWrapMode(QTextOption::WrapAtWordBoundaryOrAnywhere);
        layout.setTextOption(option);
        layout.beginLayout();
        bool fits = true;
        while (fits) {
            QTextLine line = layout.createLine();
            if (!line.isValid())
                break;
            line.setLineWidth(mBox.width());
            fits = take(line.height());
            if (fits)
                mLines << paragraph.mid(line.textStart(), line.textLength());
        }
        layout.endLayout();
        return fits;
    }

    // The last line tells that there is more.
    void cut()
    {
        // Longer than the line by what an ellipsis needs, so that it is elided in any case.
        mLines.last() =
            mMetrics.elidedText(mLines.last() + kEllipsis, Qt::ElideRight, mBox.width());
    }

    QString text() const { return mLines.join(QLatin1Char('\n')); }

private:
    bool take(qreal height)
    {
        const qreal needed = mLines.isEmpty() ? height : mHeight + mMetrics.leading() + height;
        if (!mLines.isEmpty() && needed > mBox.height())
            return false;
        mHeight = needed;
        return true;
    }

    const QFont &mFont;
    QFontMetrics mMetrics;
    QSize mBox;
    QStringList mLines;
    qreal mHeight = 0;
};

} // namespace

QString fitText(const QString &text, const QFont &font, const QSize &box)
{
    const int lines = qMax(1, box.height() / QFontMetrics(font).height());
    const QString bounded =
        plainLines(shorten(text, lines * qMax(1, box.width() / kNarrowestCharacter)));
    LineBreaker breaker(font, box);
    for (const QString &paragraph : bounded.split(QLatin1Char('\n'))) {
        if (!breaker.add(paragraph)) {
            breaker.cut();
            break;
        }
    }
    return breaker.text();
}

QString buttonText(const QString &text, const QFont &font, int width)
{
    return QFontMetrics(font)
        .elidedText(text.simplified().left(width), Qt::ElideRight, width)
        .replace(QLatin1Char('&'), QStringLiteral("&&"));
}
