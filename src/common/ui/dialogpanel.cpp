#include "common/ui/dialogpanel.h"

#include "common/ui/frames.h"
#include "common/ui/picturebutton.h"
#include "common/ui/popupoverlay.h"
#include "common/ui/selfpainted.h"
#include "common/ui/stretchedpicture.h"
#include "common/ui/textfit.h"
#include "network/systemconfig.h"

#include <QHBoxLayout>
#include <QLabel>
#include <QPainter>

namespace {

constexpr QSize kButtonSize(120, 40);
constexpr int kButtonGap = 32;
constexpr int kMargin = 32;
const char *const kTitleGround = ":/res/PopUpMenu_Title_Bg.png";

int panelWidth()
{
    return SystemConfig::mScreen_Width * 3 / 5;
}

QSize messageBox()
{
    return {panelWidth() - 2 * kMargin, SystemConfig::mScreen_Height * 2 / 5};
}

void dress(QLabel *label, int points)
{
    label->setTextFormat(Qt::PlainText);
    label->setAlignment(Qt::AlignCenter);
    setPopupColours(label);
    QFont font = label->font();
    font.setPointSize(points);
    label->setFont(font);
}

// Its style sheet would paint the ground with square corners.
class PopupTitle : public SelfPainted<QLabel>
{
public:
    using SelfPainted::SelfPainted;

protected:
    void paintEvent(QPaintEvent *) override
    {
        QPainter painter(this);
        paintPanel(painter, QLatin1String(kTitleGround), size(), Qt::TopEdge);
        painter.setPen(Qt::white);
        painter.drawText(rect(), Qt::AlignCenter, text());
    }
};

} // namespace

QLabel *makePopupTitle(QWidget *parent)
{
    auto *title = new PopupTitle(parent);
    dress(title, SystemConfig::menuFont());
    title->setStyleSheet(QStringLiteral("QLabel {border-image: url(%1); color: white;}")
                             .arg(QLatin1String(kTitleGround)));
    title->setFixedHeight(qMax(52, title->fontMetrics().height() * 2));
    return title;
}

DialogPanel::DialogPanel(const ButtonStyles &styles, QWidget *parent)
    : QFrame(parent)
    , mStyles(styles)
    , mTitle(makePopupTitle(this))
{
    setFixedWidth(panelWidth());
    auto *content = new QContentFrame(this);
    mMessage = new QLabel(content);
    dress(mMessage, SystemConfig::messageFont());
    auto *rows = new QVBoxLayout(content);
    rows->setContentsMargins(kMargin, kMargin, kMargin, kMargin);
    rows->setSpacing(kMargin);
    rows->addWidget(mMessage);
    mButtonRow = new QHBoxLayout;
    mButtonRow->setSpacing(kButtonGap);
    mButtonRow->addStretch();
    mButtonRow->addStretch();
    rows->addLayout(mButtonRow);

    auto *panel = new QVBoxLayout(this);
    panel->setContentsMargins(0, 0, 0, 0);
    panel->setSpacing(0);
    panel->addWidget(mTitle);
    panel->addWidget(content);
}

void DialogPanel::setTitle(const QString &title)
{
    const int height = mTitle->fontMetrics().lineSpacing();
    mTitle->setText(fitText(title, mTitle->font(), {panelWidth() - 2 * kMargin, height}));
}

void DialogPanel::setMessage(const QString &message)
{
    const int atLeast = 3 * mMessage->fontMetrics().lineSpacing();
    mMessage->setText(fitText(message, mMessage->font(), messageBox()));
    mMessage->setFixedHeight(qMax(atLeast, mMessage->sizeHint().height()));
}

QFont DialogPanel::messageFont() const
{
    return mMessage->font();
}

QPushButton *DialogPanel::addButton(const QString &text)
{
    auto *button = new PictureButton(this);
    QFont font = button->font();
    font.setPointSize(SystemConfig::buttonFont());
    button->setFont(font);
    button->setText(buttonText(text, font, kButtonSize.width() - 2 * kPictureBorder));
    button->setLayoutDirection(text.isRightToLeft() ? Qt::RightToLeft : Qt::LeftToRight);
    button->setFixedSize(kButtonSize);
    button->setFocusPolicy(Qt::NoFocus);
    setPopupColours(button);
    mButtonRow->insertWidget(mButtonRow->count() - 1, button);
    mButtons.append(button);
    setMarked(mButtons.size() - 1, mButtons.size() == 1);
    return button;
}

void DialogPanel::focusButton(int index)
{
    if (index < 0 || index >= mButtons.size() || index == mFocusedButton)
        return;
    setMarked(mFocusedButton, false);
    setMarked(index, true);
    mFocusedButton = index;
}

void DialogPanel::setMarked(int index, bool marked)
{
    mButtons.at(index)->setStyleSheet(marked ? mStyles.focused : mStyles.normal);
    mButtons.at(index)->setMarked(marked);
}
