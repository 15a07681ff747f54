#include "ui/detailactions.h"

#include "base/i18n.h"
#include "common/ui/picture.h"
#include "common/ui/stretchedpicture.h"
#include "ui/detailtexts.h"

#include <QPainter>

#include <algorithm>

namespace {

constexpr QSize kCell(96, 76);
constexpr int kGap = 2;
constexpr int kPicture = 28;
constexpr int kTextHeight = 16; // pixels of the font
constexpr int kFocusBorder = 2;

struct Face
{
    const char *picture;
    QString text;
};

Face faceOf(DetailAction action)
{
    switch (action) {
    case DetailAction::Play:
        return {":/res/icon_play.png", I18n::shortCut(9)};
    case DetailAction::Zoom:
        return {":/res/icon_zoom.png", DetailTexts::text(DetailTexts::Zoom)};
    case DetailAction::AddComment:
        return {":/res/icon_add_comment.png", I18n::label(6)};
    case DetailAction::AllComments:
        return {":/res/icon_comments.png", I18n::label(7)};
    case DetailAction::TagList:
        return {":/res/icon_tag.png", I18n::label(4)};
    case DetailAction::AddTag:
        return {":/res/icon_add_tag.png", I18n::label(13)};
    case DetailAction::Information:
        break;
    }
    return {":/res/icon_information.png", DetailTexts::text(DetailTexts::Information)};
}

} // namespace

DetailActionList detailActions(bool isSelfPhoto)
{
    DetailActionList actions{DetailAction::Play, DetailAction::Zoom, DetailAction::AddComment,
                             DetailAction::AllComments, DetailAction::TagList};
    if (isSelfPhoto)
        actions << DetailAction::AddTag;
    return actions << DetailAction::Information;
}

DetailActions::DetailActions(QWidget *parent)
    : QWidget(parent)
{
    QFont small = font();
    small.setPixelSize(kTextHeight);
    setFont(small);
    setActions(detailActions(false));
}

void DetailActions::setActions(const DetailActionList &actions)
{
    const DetailAction before = current();
    mActions = actions;
    mIndex = std::max(0, mActions.indexOf(before));
    update();
}

void DetailActions::setMarked(bool marked)
{
    if (marked == mMarked)
        return;
    mMarked = marked;
    update();
}

void DetailActions::move(int places)
{
    mIndex = std::clamp(mIndex + places, 0, mActions.size() - 1);
    update();
}

void DetailActions::moveToFirst()
{
    move(-mActions.size());
}

QSize DetailActions::sizeHint() const
{
    return {mActions.size() * (kCell.width() + kGap) - kGap, kCell.height()};
}

QRect DetailActions::cell(int index) const
{
    return {QPoint(index * (kCell.width() + kGap), 0), kCell};
}

void DetailActions::paintEvent(QPaintEvent *)
{
    QPainter painter(this);
    for (int i = 0; i < mActions.size(); ++i) {
        const Face face = faceOf(mActions.at(i));
        const QRect area = cell(i);
        const bool isMarked = mMarked && i == mIndex;
        if (isMarked)
            painter.drawPixmap(area.topLeft(),
                               stretchedPicture(QStringLiteral(":/res/FocusBar.png"), area.size(),
                                                kFocusBorder, this));
        painter.drawPixmap(area.left() + (area.width() - kPicture) / 2, area.top() + 5,
                           loadPicture(QString::fromLatin1(face.picture)));
        painter.setPen(isMarked ? QColor(0xff, 0xff, 0xff) : QColor(0xc5, 0xd2, 0xdb));
        painter.drawText(area.adjusted(0, 7 + kPicture, 0, 0),
                         Qt::AlignHCenter | Qt::AlignTop | Qt::TextWordWrap, face.text);
    }
}
