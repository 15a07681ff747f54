#include "common/ui/qpopupdialog.h"

#include "base/log.h"
#include "common/ui/dialogpanel.h"
#include "common/ui/remotekeys.h"

#include <QKeyEvent>
#include <QPushButton>

namespace {

constexpr int kMostButtons = 2;

DialogPanel::ButtonStyles styles()
{
    return {QStringLiteral("border-image: url(:/res/Button_Focus.png); outline-width: 0px; "
                           "border-width: 6px;"),
            QStringLiteral("border-image: url(:/res/Button_Normal.png); outline-width: 0px; "
                           "border-width: 6px;")};
}

} // namespace

QPopupDialog::QPopupDialog(QWidget *parent)
    : PopupOverlay(parent)
{
}

void QPopupDialog::initDialog(QString title, QString message, const QList<QString> &buttons)
{
    if (buttons.isEmpty() || buttons.size() > kMostButtons) {
        logLine("QPopupDialog::initDialog ERROR, empty or out of max(2) buttons !!");
        return;
    }
    mPanel = new DialogPanel(styles(), this);
    mPanel->setTitle(title);
    mPanel->setMessage(message);
    for (int i = 0; i < buttons.size(); ++i) {
        const QPushButton *button = mPanel->addButton(buttons.at(i));
        connect(button, &QPushButton::clicked, this, [this, i] { press(i); });
    }
    setPanel(mPanel);
}

void QPopupDialog::press(int button)
{
    if (button == 0)
        emit accepted();
    else
        emit rejected();
}

void QPopupDialog::keyPressEvent(QKeyEvent *event)
{
    logLine("QPopupDialog::keyPressEvent!!!");
    if (!mPanel) { // nothing was built that could answer
        event->ignore();
        return;
    }
    event->accept();
    switch (event->key()) {
    case DEVICE_RIGHT_KEY:
        mPanel->focusButton(mPanel->focusedButton() + 1);
        break;
    case DEVICE_LEFT_KEY:
        mPanel->focusButton(mPanel->focusedButton() - 1);
        break;
    case DEVICE_SELECT_KEY:
        press(mPanel->focusedButton());
        break;
    case DEVICE_RETURN_KEY:
        press(mPanel->buttonCount() - 1);
        break;
    default:
        break;
    }
}
