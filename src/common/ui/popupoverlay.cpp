#include "common/ui/popupoverlay.h"

#include "network/systemconfig.h"

#include <QApplication>
#include <QGridLayout>
#include <QKeyEvent>
#include <QPainter>

namespace {

const QColor kDim(5, 9, 13, 170);

} // namespace

PopupOverlay::PopupOverlay(QWidget *parent)
    : QWidget(parent)
{
    setFocusPolicy(Qt::StrongFocus);
    auto *rows = new QGridLayout(this);
    rows->setContentsMargins(0, 0, 0, 0);
    if (parent)
        parent->installEventFilter(this);
    cover();
}

PopupOverlay::~PopupOverlay()
{
    giveFocusBack();
}

bool PopupOverlay::holdsFocus()
{
    for (const QWidget *at = QApplication::focusWidget(); at; at = at->parentWidget()) {
        if (qobject_cast<const PopupOverlay *>(at) && at->isVisible())
            return true;
    }
    return false;
}

void PopupOverlay::setPanel(QWidget *panel)
{
    if (mPanel) {
        mPanel->hide();
        mPanel->deleteLater();
    }
    mPanel = panel;
    static_cast<QGridLayout *>(layout())->addWidget(panel, 0, 0, Qt::AlignCenter);
}

bool PopupOverlay::eventFilter(QObject *watched, QEvent *event)
{
    if (watched == parent() && event->type() == QEvent::Resize)
        cover();
    return QWidget::eventFilter(watched, event);
}

void PopupOverlay::cover()
{
    const QWidget *below = parentWidget();
    if (!below)
        resize(SystemConfig::mScreen_Width, SystemConfig::mScreen_Height);
    else if (!below->layout() || below->layout()->indexOf(this) < 0)
        setGeometry(below->rect());
}

bool PopupOverlay::isNested() const
{
    for (const QWidget *above = parentWidget(); above; above = above->parentWidget()) {
        if (qobject_cast<const PopupOverlay *>(above))
            return true;
    }
    return false;
}

void PopupOverlay::showEvent(QShowEvent *event)
{
    cover();
    raise();
    takeFocus();
    QWidget::showEvent(event);
}

void PopupOverlay::hideEvent(QHideEvent *event)
{
    giveFocusBack();
    QWidget::hideEvent(event);
}

void PopupOverlay::takeFocus()
{
    if (focusPolicy() == Qt::NoFocus || isNested())
        return;
    QWidget *before = window()->focusWidget();
    if (before != this && !isAncestorOf(before))
        mFocusBefore = before;
    focusReceiver()->setFocus();
}

void PopupOverlay::giveFocusBack()
{
    const QWidget *focus = window()->focusWidget();
    const bool isOurs = focus == this || isAncestorOf(focus);
    if (isOurs && mFocusBefore && mFocusBefore->isVisible())
        mFocusBefore->setFocus();
    else if (isOurs && mFocusBefore && parentWidget() && parentWidget()->isVisible())
        parentWidget()->setFocus();
    mFocusBefore = nullptr;
}

void PopupOverlay::paintEvent(QPaintEvent *)
{
    if (isNested() || !mPanel)
        return;
    QPainter(this).fillRect(rect(), kDim);
}

void PopupOverlay::keyPressEvent(QKeyEvent *event)
{
    event->accept();
}

// Tab must not lead to what lies below; while it hides, the focus may go where Qt puts it.
bool PopupOverlay::focusNextPrevChild(bool next)
{
    return !isVisible() && QWidget::focusNextPrevChild(next);
}

void setPopupColours(QWidget *widget)
{
    const QColor text(0xf2, 0xf6, 0xf9);
    const QColor dimmed(0x75, 0x84, 0x8f);
    QPalette palette = widget->palette();
    for (QPalette::ColorRole role : {QPalette::WindowText, QPalette::Text, QPalette::ButtonText}) {
        palette.setColor(role, text);
        palette.setColor(QPalette::Disabled, role, dimmed);
    }
    widget->setPalette(palette);
}
