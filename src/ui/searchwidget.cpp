#include "ui/searchwidget.h"

#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/picture.h"
#include "common/ui/remotekeys.h"
#include "network/systemconfig.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QPainter>

namespace {

const char *const FIELD_PLAIN = "QLineEdit{border-radius: 9px;border-style: outset;"
                                "border-width: 1px;border-color: black;}";
const char *const FIELD_MARKED = "QLineEdit{border-radius: 9px;border-style: outset;"
                                 "border-width: 2px;border-color: green;}";
const char *const BUTTON_EMPTY = "QLabel{background-color:#D1D1D1;border-radius: 9px; "
                                 "border-style: solid;border-width: 1px;border-color: gray;}";
const char *const BUTTON_READY = "QLabel{background-color:#D1D1D1;border-radius: 9px; "
                                 "border-style: solid;border-width: 1px;border-color: black;}";
const char *const BUTTON_MARKED = "QLabel{background-color:#D1D1D1;border-radius: 9px; "
                                  "border-style: solid;border-width: 2px;border-color: green;}";
const char *const BAR_FOCUSED = "QLabel{border-width: 2px}";
const char *const BAR_UNFOCUSED = "QFrame{border-width: 0px;}QLabel{border-width: 1px}";

constexpr int kHeight = 60; // of field and button, pixels
constexpr int kRing = 3;    // around the marked part, with a gap of as much
constexpr int kRingRadius = 14;
constexpr int kGap = 14; // between field and button

// A sheet set anew costs a layout, so only one that differs is set.
void setSheet(QWidget *widget, const char *sheet)
{
    const QString text = QString::fromLatin1(sheet);
    if (widget->styleSheet() != text)
        widget->setStyleSheet(text);
}

QSpacerItem *makeSpacer()
{
    return new QSpacerItem(20, 40, QSizePolicy::Expanding, QSizePolicy::Fixed);
}

} // namespace

SearchWidget::SearchWidget(QWidget *parent)
    : QWidget(parent)
    , mField(new QLineEdit(this))
    , mButton(new QLabel(this))
{
    setFocusPolicy(Qt::StrongFocus);
    setFixedSize(SystemConfig::mScreen_Width, SystemConfig::mScreen_Height * 6 / 8 - 50);
    mField->setReadOnly(true);
    mField->setFocusPolicy(Qt::NoFocus);
    mField->setFixedSize(SystemConfig::mScreen_Width - 800, kHeight);
    mField->setTextMargins(12, 0, 12, 0);
    mField->setPlaceholderText(I18n::label(9));
    QPalette colours = mField->palette();
    colours.setColor(QPalette::PlaceholderText, QColor(0x52, 0x5d, 0x66));
    mField->setPalette(colours);
    QFont font = mField->font();
    font.setPixelSize(26);
    mField->setFont(font);
    mButton->setFixedSize(kHeight, kHeight);
    mButton->setPixmap(loadPicture(QStringLiteral(":/res/search.png"), QSize(kHeight, kHeight)));

    auto *row = new QHBoxLayout(this);
    row->setContentsMargins(0, 20, 0, 20);
    row->setSpacing(kGap);
    row->addItem(makeSpacer());
    row->addWidget(mField);
    row->addWidget(mButton);
    row->addItem(makeSpacer());
    for (int i = 0; i < row->count(); ++i)
        row->setStretch(i, i == 1 ? 3 : 1);
    setText(QString());
}

void SearchWidget::setText(const QString &text)
{
    mField->setText(text);
    showButton(!text.isEmpty());
    setSheet(mField, FIELD_PLAIN);
}

QString SearchWidget::text() const
{
    return mField->text();
}

void SearchWidget::showButton(bool ready)
{
    mButton->setEnabled(ready);
    setSheet(mButton, ready ? BUTTON_READY : BUTTON_EMPTY);
}

void SearchWidget::setFrame()
{
    logLine("setFrame");
    if (mCurrentFocus == Button) {
        setSheet(mField, FIELD_PLAIN);
        setSheet(mButton, BUTTON_MARKED);
    } else if (mCurrentFocus == Field) {
        logLine("mCurrentFoucs = 0");
        setSheet(mField, FIELD_MARKED);
        showButton(!mField->text().isEmpty());
    }
    update();
}

// A green line of two pixels is too little to be found across a room.
void SearchWidget::paintEvent(QPaintEvent *)
{
    if (!hasFocus())
        return;
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(QPen(QColor(0xf2, 0xf6, 0xf9), kRing));
    const QWidget *marked = mCurrentFocus == Button ? static_cast<QWidget *>(mButton) : mField;
    const qreal gap = 1.5 * kRing;
    painter.drawRoundedRect(QRectF(marked->geometry()).adjusted(-gap, -gap, gap, gap), kRingRadius,
                            kRingRadius);
}

void SearchWidget::keyPressEvent(QKeyEvent *event)
{
    event->accept();
    switch (event->key()) {
    case DEVICE_UP_KEY:
    case DEVICE_RED_KEY:
    case DEVICE_RETURN_KEY:
        event->ignore(); // the screen's
        break;
    case DEVICE_SELECT_KEY:
        select();
        break;
    case DEVICE_LEFT_KEY:
        mCurrentFocus = Field;
        setFrame();
        break;
    case DEVICE_RIGHT_KEY:
        mCurrentFocus = mField->text().isEmpty() ? Field : Button;
        setFrame();
        break;
    default:
        break;
    }
}

void SearchWidget::select()
{
    if (mCurrentFocus == Field)
        emit showInputDialog();
    else if (mCurrentFocus == Button)
        emit startSearch(mField->text());
    else
        logLine("wrong mCurrentFocus SearchWidget::keyPressEvent");
}

void SearchWidget::focusInEvent(QFocusEvent *event)
{
    QWidget::focusInEvent(event);
    setSheet(this, BAR_FOCUSED);
    setFrame();
}

void SearchWidget::focusOutEvent(QFocusEvent *event)
{
    QWidget::focusOutEvent(event);
    setSheet(this, BAR_UNFOCUSED);
    setSheet(mField, FIELD_PLAIN);
    mCurrentFocus = Field;
    setSheet(mButton, mField->text().isEmpty() ? BUTTON_EMPTY : BUTTON_READY);
}
