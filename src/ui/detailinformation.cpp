#include "ui/detailinformation.h"

#include "base/i18n.h"
#include "common/ui/picture.h"
#include "common/ui/textfit.h"
#include "ui/detailnotes.h"
#include "ui/detailtexts.h"

#include <QLocale>
#include <QPainter>

#include <algorithm>

namespace {

constexpr int kMargin = 16;
constexpr int kPicture = 20; // side of the small pictures
constexpr int kIndent = 30;  // of a text beside one
constexpr int kMostComments = 10;
constexpr int kLinesOfEach = 4; // of a comment among others
constexpr int kLinesOfOne = 12;

const QColor kBright(0xf2, 0xf6, 0xf9);
const QColor kPlain(0xe6, 0xed, 0xf2);
const QColor kQuiet(0xa2, 0xbb, 0xc9);

QString dateText(const QDateTime &time)
{
    return time.isValid() ? QLocale::c().toString(time, QStringLiteral("d MMMM yyyy, hh:mm"))
                          : QString();
}

QString sizeText(const QSize &size)
{
    if (size.isEmpty())
        return QString();
    return DetailTexts::text(DetailTexts::Pixels)
        .arg(QString::number(size.width()), QString::number(size.height()));
}

QString ownerText(const QString &owner)
{
    // Not by arg(): a name may hold a place marker.
    return owner.isEmpty() ? QString()
                           : DetailTexts::text(DetailTexts::By) + QLatin1Char(' ') + owner;
}

} // namespace

DetailInformation::DetailInformation(QWidget *parent)
    : QWidget(parent)
{
}

QSize DetailInformation::sizeHint() const
{
    return {340, 400};
}

void DetailInformation::showNotes(const DetailPhoto &photo, const DetailNotes &notes,
                                  const QString &position)
{
    mParts.clear();
    addFacts(photo, position);
    addTags(notes);
    addComments(notes);
    layOut();
    update();
}

void DetailInformation::addFacts(const DetailPhoto &photo, const QString &position)
{
    const bool hasTitle = !photo.title.isEmpty();
    mParts << Part{hasTitle ? photo.title : DetailTexts::text(DetailTexts::Untitled),
                   26,
                   hasTitle,
                   hasTitle ? kBright : kQuiet,
                   3,
                   0,
                   QString()};
    mParts << Part{photo.summary, 20, false, kPlain, 4, 6, QString()};
    mParts << Part{ownerText(photo.owner), 18, false, kQuiet, 1, 10, ":/res/icon_person.png"};
    mParts << Part{dateText(photo.published), 18, false, kQuiet, 1, 4, ":/res/icon_clock.png"};
    const QString pixels = sizeText(photo.size);
    mParts << Part{pixels.isEmpty() ? position : position + QStringLiteral(",  ") + pixels,
                   18,
                   false,
                   kQuiet,
                   1,
                   4,
                   ":/res/icon_information.png"};
}

void DetailInformation::addTags(const DetailNotes &notes)
{
    const bool hasTags = !notes.tags().isEmpty();
    mParts << Part{hasTags ? notes.tags().join(QStringLiteral(", ")) : I18n::label(15),
                   18,
                   false,
                   hasTags ? kPlain : kQuiet,
                   2,
                   4,
                   ":/res/icon_tag.png"};
}

void DetailInformation::addComments(const DetailNotes &notes)
{
    const QString heading =
        I18n::label(5) + QLatin1Char(' ') + QString::number(notes.commentCount());
    mParts << Part{heading, 18, true, kPlain, 1, 12, ":/res/icon_comment.png"};
    QString state;
    switch (notes.commentState()) {
    case DetailNotes::State::Waiting:
        state = notes.commentCount() > 0 ? DetailTexts::text(DetailTexts::LoadingComments) : "";
        break;
    case DetailNotes::State::Ready:
        state = notes.comments().isEmpty() ? DetailTexts::text(DetailTexts::NoComments) : "";
        break;
    case DetailNotes::State::Failed:
        state = DetailTexts::text(DetailTexts::CommentsFailed);
        break;
    case DetailNotes::State::Gone:
        state = DetailTexts::text(DetailTexts::PhotoGone);
    }
    mParts << Part{state, 18, false, kQuiet, 2, 4, QString()};
    const QVector<DetailComment> newest = notes.comments().mid(0, kMostComments);
    for (const DetailComment &comment : newest)
        addComment(comment, newest.size() == 1 ? kLinesOfOne : kLinesOfEach);
}

// The name comes last, so that one from another script does not turn the line around.
void DetailInformation::addComment(const DetailComment &comment, int mostLines)
{
    QStringList heading;
    if (comment.created.isValid())
        heading << QLocale::c().toString(comment.created, QStringLiteral("d MMMM yyyy"));
    if (!comment.author.isEmpty())
        heading << comment.author;
    mParts << Part{heading.join(QStringLiteral(", ")), 16, false, kQuiet, 1, 10, QString()};
    mParts << Part{comment.text, 18, false, kPlain, mostLines, 0, QString()};
}

// From the top down, until the room is used up.
void DetailInformation::layOut()
{
    mPlaced.clear();
    int top = kMargin;
    for (const Part &part : qAsConst(mParts)) {
        if (part.text.isEmpty())
            continue;
        QFont look = font();
        look.setPixelSize(part.pixels);
        look.setBold(part.isBold);
        const int line = QFontMetrics(look).lineSpacing();
        top += part.spaceAbove;
        const int lines = std::min(part.mostLines, (height() - kMargin - top) / line);
        if (lines < 1)
            break;
        const int left = kMargin + (part.picture.isEmpty() ? 0 : kIndent);
        const QSize box(std::max(1, width() - left - kMargin), lines * line + line / 3);
        const QString fitted = fitText(part.text, look, box);
        const int needed =
            QFontMetrics(look).boundingRect(QRect(QPoint(), box), Qt::AlignLeft, fitted).height();
        mPlaced << PlacedPart{fitted, look, part.colour,
                              QRect(left, top, box.width(), std::min(box.height(), needed)),
                              part.picture};
        top += mPlaced.last().area.height();
    }
}

QStringList DetailInformation::texts() const
{
    QStringList result;
    for (const PlacedPart &part : mPlaced)
        result << part.text;
    return result;
}

void DetailInformation::paintEvent(QPaintEvent *)
{
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(QColor(0x0b, 0x10, 0x16, 0x70));
    painter.drawRoundedRect(rect(), 10, 10);
    for (const PlacedPart &part : qAsConst(mPlaced)) {
        const int line = QFontMetrics(part.font).lineSpacing();
        if (!part.picture.isEmpty())
            painter.drawPixmap(kMargin, part.area.top() + (line - kPicture) / 2,
                               loadPicture(part.picture, QSize(kPicture, kPicture)));
        painter.setLayoutDirection(part.text.isRightToLeft() ? Qt::RightToLeft : Qt::LeftToRight);
        painter.setFont(part.font);
        painter.setPen(part.colour);
        painter.drawText(part.area, Qt::AlignLeft | Qt::AlignTop, part.text);
    }
}

void DetailInformation::resizeEvent(QResizeEvent *event)
{
    QWidget::resizeEvent(event);
    layOut();
}
