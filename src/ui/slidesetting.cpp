#include "ui/slidesetting.h"

#include "base/i18n.h"
#include "common/ui/dialogpanel.h"
#include "common/ui/frames.h"
#include "common/ui/picturebutton.h"
#include "common/ui/remotekeys.h"
#include "network/systemconfig.h"
#include "ui/settingitem.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QPainter>
#include <QVBoxLayout>

int SlideSetting::SlideMode = 0;
int SlideSetting::SlideSpeed = 6;

namespace {

enum LabelText {
    SettingTitle = 19,
    ModeCaption = 20,
    SpeedCaption = 21,
    NormalChoice = 22,
    RandomChoice = 23,
    ShuffleChoice = 24,
    SecondsSuffix = 25
};
enum ButtonText { CancelText = 4, OkText = 6 };

constexpr QSize kButtonSize(120, 40);
const QColor kVeil(115, 115, 115, 200);

} // namespace

SlideSetting::SlideSetting(QWidget *parent)
    : QWidget(parent)
{
    auto *frame = new QFrame(this);
    frame->setFixedSize(SystemConfig::mScreen_Width / 2,
                        static_cast<int>(SystemConfig::mScreen_Height * 0.4));
    auto *middle = new QHBoxLayout(this);
    middle->setContentsMargins(0, 0, 0, 0);
    middle->addWidget(frame, 0, Qt::AlignCenter);

    auto *content = new QContentFrame(frame);
    auto *column = new QVBoxLayout(frame);
    column->setContentsMargins(0, 0, 0, 0);
    column->setSpacing(0);
    QLabel *title = makePopupTitle(frame);
    title->setText(I18n::label(SettingTitle));
    column->addWidget(title);
    column->addWidget(content, 1);
    buildRows(content);
}

void SlideSetting::buildRows(QFrame *content)
{
    mModeRow = new SettingItem(I18n::label(ModeCaption), content);
    mModeRow->setChoices(
        {I18n::label(NormalChoice), I18n::label(RandomChoice), I18n::label(ShuffleChoice)});
    mSpeedRow = new SettingItem(I18n::label(SpeedCaption), content);
    mSpeedRow->setSuffix(I18n::label(SecondsSuffix));
    QPushButton *ok = makeButton(I18n::button(OkText));
    QPushButton *cancel = makeButton(I18n::button(CancelText));
    mParts = {mModeRow, mSpeedRow, ok, cancel};

    auto *buttons = new QHBoxLayout;
    for (QPushButton *button : {ok, cancel}) {
        buttons->addItem(new QSpacerItem(40, 20, QSizePolicy::Expanding, QSizePolicy::Minimum));
        buttons->addWidget(button);
    }
    buttons->addItem(new QSpacerItem(40, 20, QSizePolicy::Expanding, QSizePolicy::Minimum));

    auto *rows = new QVBoxLayout(content);
    rows->setContentsMargins(32, 16, 32, 20);
    rows->addStretch();
    rows->addWidget(mModeRow);
    rows->addWidget(mSpeedRow);
    rows->addStretch();
    rows->addLayout(buttons);
}

QPushButton *SlideSetting::makeButton(const QString &text)
{
    auto *button = new PictureButton(text, this);
    QFont font = button->font();
    font.setPointSize(SystemConfig::buttonFont());
    button->setFont(font);
    button->setFixedSize(kButtonSize);
    QPalette palette = button->palette();
    palette.setColor(QPalette::ButtonText, QColor(0xf2, 0xf6, 0xf9));
    button->setPalette(palette);
    button->setStyleSheet(
        QStringLiteral("QPushButton {border-image: url(:/res/Button_Normal.png); outline-width: "
                       "0px; border-width: 6px;}QPushButton:focus {border-image: "
                       "url(:/res/Button_Focus.png); outline-width: 0px; border-width: 6px;}"));
    button->installEventFilter(this);
    return button;
}

void SlideSetting::load()
{
    mModeRow->setValue(SettingItem::Choice, SlideMode);
    mSpeedRow->setValue(SettingItem::Number, SlideSpeed);
    mFocusIndex = OkButton;
    mParts.at(mFocusIndex)->setFocus();
}

int SlideSetting::mode() const
{
    return mModeRow->value();
}

int SlideSetting::speed() const
{
    return mSpeedRow->value();
}

// The buttons' keys; the rows pass on theirs themselves.
bool SlideSetting::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() != QEvent::KeyPress)
        return QWidget::eventFilter(watched, event);
    keyPressEvent(static_cast<QKeyEvent *>(event));
    return true;
}

// No key goes further: what is behind the panel must not answer it.
void SlideSetting::keyPressEvent(QKeyEvent *event)
{
    event->accept();
    if (event->key() == DEVICE_RETURN_KEY) {
        emit clickCancel();
        return;
    }
    if (event->key() == DEVICE_SELECT_KEY) {
        select();
        return;
    }
    moveFocus(event->key());
    mParts.at(mFocusIndex)->setFocus();
}

void SlideSetting::moveFocus(int key)
{
    if (key == DEVICE_RIGHT_KEY && mFocusIndex == OkButton)
        mFocusIndex = CancelButton;
    else if (key == DEVICE_LEFT_KEY && mFocusIndex == CancelButton)
        mFocusIndex = OkButton;
    else if (key == DEVICE_DOWN_KEY && mFocusIndex < OkButton)
        ++mFocusIndex;
    else if (key == DEVICE_UP_KEY && mFocusIndex > ModeRow)
        mFocusIndex = mFocusIndex == SpeedRow ? ModeRow : SpeedRow;
}

void SlideSetting::select()
{
    if (mFocusIndex == OkButton)
        emit clickConfirm();
    else if (mFocusIndex == CancelButton)
        emit clickCancel();
}

void SlideSetting::paintEvent(QPaintEvent *event)
{
    QPainter(this).fillRect(event->rect(), kVeil);
}
