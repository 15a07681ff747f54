#include "accountmanager/errordialog.h"

#include "base/i18n.h"
#include "common/ui/dialogpanel.h"
#include "common/ui/remotekeys.h"

#include <QKeyEvent>
#include <QPushButton>

ErrorDialog::ErrorDialog(QWidget *parent)
    : PopupOverlay(parent)
{
}

void ErrorDialog::retranslateUi(const QString &title, const QString &errorText,
                                bool hideCloseButton)
{
    const QString style =
        QStringLiteral("border-image: url(%1); outline-width: 0px; border-width: 6px;");
    auto *panel = new DialogPanel({style.arg(QStringLiteral(":/res/Button_Focus.png")),
                                   style.arg(QStringLiteral(":/res/Button_Normal.png"))},
                                  this);
    panel->setTitle(title);
    panel->setMessage(errorText);
    if (!hideCloseButton)
        connect(panel->addButton(I18n::button(5)), &QPushButton::clicked, this,
                &ErrorDialog::leave);
    setPanel(panel);
}

void ErrorDialog::leave()
{
    hide();
    deleteLater();
    emit errorExitApp();
}

void ErrorDialog::keyPressEvent(QKeyEvent *event)
{
    event->accept();
    if (event->key() == DEVICE_RETURN_KEY || event->key() == DEVICE_SELECT_KEY)
        leave();
}
