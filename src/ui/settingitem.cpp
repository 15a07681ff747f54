#include "ui/settingitem.h"

#include "common/ui/picture.h"
#include "common/ui/remotekeys.h"
#include "common/ui/stretchedpicture.h"
#include "data/htmlentities.h"
#include "network/systemconfig.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QPainter>

#include <limits>

namespace {

constexpr int kSmallestNumber = 5;
constexpr int kValueWidth = 150;
constexpr int kRowHeight = 48;
constexpr int kMargin = 12;
constexpr qreal kFrame = 2.5; // of the focused row
const QColor kTextColour(0xf2, 0xf6, 0xf9);

template <class Label>
Label *dress(Label *label, Qt::Alignment alignment)
{
    label->setTextFormat(Qt::PlainText);
    label->setAlignment(alignment);
    QFont font = label->font();
    font.setPointSize(SystemConfig::messageFont());
    label->setFont(font);
    QPalette palette = label->palette();
    palette.setColor(QPalette::WindowText, kTextColour);
    label->setPalette(palette);
    return label;
}

QLabel *makeArrow(const QString &picture, QWidget *parent)
{
    auto *arrow = new QLabel(parent);
    arrow->setPixmap(loadPicture(picture));
    arrow->setAlignment(Qt::AlignCenter);
    return arrow;
}

} // namespace

// Its style sheet would blur the box around a value that is edited, on a dense screen.
class ValueLabel : public SelfPainted<QLabel>
{
public:
    using SelfPainted::SelfPainted;

    bool mIsBoxed = false;

protected:
    void paintEvent(QPaintEvent *) override
    {
        QPainter painter(this);
        if (mIsBoxed)
            painter.drawPixmap(0, 0,
                               stretchedPicture(QStringLiteral(":/res/InputBox_Normal.png"), size(),
                                                kPictureBorder, this));
        painter.setPen(kTextColour);
        painter.drawText(rect(), Qt::AlignCenter, text());
    }
};

SettingItem::SettingItem(const QString &caption, QWidget *parent)
    : SelfPainted(parent)
    , mCaption(dress(new QLabel(this), Qt::AlignRight | Qt::AlignVCenter))
    , mValueLabel(dress(new ValueLabel(this), Qt::AlignCenter))
{
    setFocusPolicy(Qt::StrongFocus);
    setFixedHeight(kRowHeight);
    mCaption->setText(unescapeHtml(caption));
    mValueLabel->setFixedWidth(kValueWidth);
    auto *row = new QHBoxLayout(this);
    row->setSpacing(12);
    row->addWidget(mCaption, 1);
    auto *value = new QHBoxLayout;
    value->addWidget(makeArrow(QStringLiteral(":/res/Arrow_Up.png"), this));
    value->addWidget(mValueLabel);
    value->addWidget(makeArrow(QStringLiteral(":/res/Arrow_Down.png"), this));
    row->addLayout(value, 1);
    showFocus(false);
}

void SettingItem::setChoices(const QStringList &choices)
{
    mChoices = choices;
    redraw();
}

void SettingItem::setSuffix(const QString &suffix)
{
    mSuffix = suffix;
    redraw();
}

void SettingItem::setValue(int kind, int value)
{
    mKind = kind;
    mValue = value;
    setEditing(false);
}

QString SettingItem::valueText() const
{
    return mKind == Choice ? mChoices.value(mValue) : QString::number(mValue) + mSuffix;
}

void SettingItem::keyPressEvent(QKeyEvent *event)
{
    if (event->key() == DEVICE_SELECT_KEY) {
        setEditing(!mIsEditing);
    } else if (mIsEditing && event->key() == DEVICE_DOWN_KEY) {
        increase();
    } else if (mIsEditing && event->key() == DEVICE_UP_KEY) {
        decrease();
    } else {
        event->ignore();
    }
}

void SettingItem::increase()
{
    const int last = mKind == Choice ? mChoices.size() - 1 : std::numeric_limits<int>::max();
    if (mValue < last)
        ++mValue;
    redraw();
}

void SettingItem::decrease()
{
    if (mValue > 0)
        --mValue;
    if (mKind == Number && mValue < kSmallestNumber)
        mValue = kSmallestNumber;
    redraw();
}

void SettingItem::setEditing(bool isEditing)
{
    mIsEditing = isEditing;
    mValueLabel->mIsBoxed = isEditing;
    mValueLabel->setStyleSheet(
        isEditing
            ? QStringLiteral("border-image: url(:/res/InputBox_Normal.png); border-width: 6px;")
            : QStringLiteral("border-image: none;"));
    redraw();
}

void SettingItem::redraw()
{
    mValueLabel->setText(valueText());
}

void SettingItem::focusInEvent(QFocusEvent *event)
{
    QFrame::focusInEvent(event);
    showFocus(true);
}

void SettingItem::focusOutEvent(QFocusEvent *event)
{
    QFrame::focusOutEvent(event);
    showFocus(false);
}

// The picture alone is hardly brighter than the panel: the frame is what shows the focus.
void SettingItem::paintEvent(QPaintEvent *)
{
    if (!hasFocus())
        return;
    QPainter painter(this);
    painter.drawPixmap(
        0, 0,
        stretchedPicture(QStringLiteral(":/res/Button_Normal.png"), size(), kPictureBorder, this));
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(QPen(QColor(0xf2, 0xf6, 0xf9), kFrame));
    const qreal inset = kFrame / 2;
    painter.drawRoundedRect(QRectF(rect()).adjusted(inset, inset, -inset, -inset), 5, 5);
}

void SettingItem::showFocus(bool hasFocus)
{
    // The sheet's border takes its room from the row, whose parts must not move.
    const int margin = hasFocus ? kMargin - kPictureBorder : kMargin;
    layout()->setContentsMargins(margin, 0, margin, 0);
    setStyleSheet(hasFocus ? QStringLiteral("SettingItem { border-image: url(%1); outline-width: "
                                            "0px; border-width: 6px;}")
                                 .arg(QStringLiteral(":/res/Button_Normal.png"))
                           : QStringLiteral("SettingItem {background-color: transparent; border: "
                                            "0px;}"));
}
