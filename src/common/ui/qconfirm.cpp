#include "common/ui/qconfirm.h"

#include "accountmanager/accountmanagerhelper.h"
#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/dialogpanel.h"
#include "common/ui/remotekeys.h"
#include "data/htmlentities.h"
#include "network/systemconfig.h"

#include <QFontMetrics>
#include <QKeyEvent>
#include <QPushButton>

namespace {

enum Button { YesButton = 0, NoButton = 1 };

constexpr int kLongestTag = 2000; // characters, far more than are ever shown

DialogPanel::ButtonStyles styles()
{
    const QString style =
        QStringLiteral("border-style:outset; border-image:url(%1); border-width: 6px;");
    return {style.arg(QStringLiteral(":/res/Button_Focus.png")),
            style.arg(QStringLiteral(":/res/Button_Normal.png"))};
}

QString tagQuestion(const QString &tag, const QFont &font)
{
    const QString question = I18n::label(8) + QLatin1Char(' ') + tag.left(kLongestTag);
    const int panelWidth = SystemConfig::mScreen_Width * 3 / 5;
    const int width = int(1.3 * panelWidth);
    return unescapeHtml(QFontMetrics(font).elidedText(question, Qt::ElideRight, width));
}

QString titleOf(int type)
{
    switch (type) {
    case QConfirm::DeleteTag:
        return I18n::title(5);
    case QConfirm::SignOut:
        return I18n::title(8);
    case QConfirm::DeleteAccount:
        return I18n::label(28);
    default:
        return I18n::title(13);
    }
}

QString messageOf(int type, const QString &text, const QFont &font)
{
    switch (type) {
    case QConfirm::DeleteTag:
        return tagQuestion(text, font);
    case QConfirm::SignOut:
        return I18n::label(10) + QStringLiteral("  ") + AccountManagerHelper::getUserName() +
               QLatin1Char('?');
    case QConfirm::DeleteAccount:
        return I18n::label(27);
    default:
        return I18n::label(29) + QStringLiteral("Are you sure to exit qtorvala") + QLatin1Char('?');
    }
}

bool isQuestion(int type)
{
    return type >= QConfirm::DeleteTag && type <= QConfirm::UnknownUser;
}

} // namespace

QConfirm::QConfirm(QWidget *parent)
    : PopupOverlay(parent)
{
}

void QConfirm::init(int type, QString text)
{
    mType = type;
    logLine("enter QConfirm::init");
    logLine("{QConfirm::init} mType = ", mType);
    if (!isQuestion(mType))
        return;
    mPanel = new DialogPanel(styles(), this);
    mPanel->setTitle(titleOf(mType));
    mPanel->setMessage(messageOf(mType, text, mPanel->messageFont()));
    for (int button : {YesButton, NoButton}) {
        connect(mPanel->addButton(I18n::button(button)), &QPushButton::clicked, this,
                [this, button] { answer(button); });
    }
    setPanel(mPanel);
}

void QConfirm::answer(int button)
{
    if (button == YesButton)
        emit clickConfirm();
    else
        emit clickCancel();
}

void QConfirm::keyPressEvent(QKeyEvent *event)
{
    logLine("{QConfirm::keyPressEvent} key value = ", event->key());
    if (!isQuestion(mType)) {
        event->ignore();
        return;
    }
    // The form that hosts the question, if one does, knows what Return means.
    event->setAccepted(event->key() != DEVICE_RETURN_KEY || !isNested());
    if (event->key() == DEVICE_RIGHT_KEY)
        mPanel->focusButton(NoButton);
    else if (event->key() == DEVICE_LEFT_KEY)
        mPanel->focusButton(YesButton);
    else if (event->key() == DEVICE_SELECT_KEY)
        answer(mPanel->focusedButton());
}
