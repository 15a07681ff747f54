#include "accountmanager/loginpage.h"

#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/accountswidget.h"
#include "accountmanager/accounttexts.h"
#include "accountmanager/pagebutton.h"
#include "accountmanager/protectioncode.h"
#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/closelater.h"
#include "common/ui/qconfirm.h"
#include "common/ui/remotekeys.h"
#include "common/ui/scrollbarstyle.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QVBoxLayout>

namespace {

// The focus rules work on the focused widget alone: nothing is set again when the focus moves.
const QString kStyle = QStringLiteral(
    "QLabel {color: white; font-size: 22px;}"
    "QLabel#title {font-size: 28px;}"
    "QLabel#hint {color: #d5dfe6; margin-top: 12px;}"
    "QLabel#message {color: #ffd27a; font-size: 20px;}"
    "QPushButton {border-image: url(:/res/Button_Normal.png) 6; border-width: 6px;"
    " outline-width: 0px; color: white; font-size: 22px;}"
    "QPushButton:focus {border-image: url(:/res/Button_Focus.png) 6; border-width: 6px;}"
    "QScrollArea, QWidget#rows {background: transparent;}");

QLabel *makeLabel(QWidget *parent, const char *name, const QString &text)
{
    auto *label = new QLabel(parent);
    label->setObjectName(QLatin1String(name));
    label->setTextFormat(Qt::PlainText);
    label->setWordWrap(true);
    label->setIndent(0); // all in line, whatever their styles
    label->setText(text);
    return label;
}

// False when the database gave no answer; it may take a while, so it is not asked again.
bool readAccounts(QVector<AccountsWidget::Account> *accounts)
{
    const AccountManagerHelper::Session session;
    QStringList mails = AccountManagerHelper::getAccounts(true);
    if (AccountManagerHelper::hasFailed())
        return false;
    const QString latest = AccountManagerHelper::getLatestLoginAccount();
    if (mails.removeOne(latest))
        mails.prepend(latest);
    for (const QString &mail : qAsConst(mails)) {
        accounts->append({mail, AccountManagerHelper::getDisplayName(mail)});
        if (AccountManagerHelper::hasFailed())
            return false;
    }
    return true;
}

} // namespace

LoginPage::LoginPage(QWidget *parent)
    : QWidget(parent)
    , mAccounts(new AccountsWidget(this))
    , mHint(makeLabel(this, "hint", AccountTexts::text(AccountTexts::NoAccounts)))
    , mMessage(makeLabel(this, "message", QString()))
{
    buildLayout();
    connect(mAccounts, &AccountsWidget::accountChosen, this, &LoginPage::handleSelectIndex);
    connect(mAccounts, &AccountsWidget::deletionChosen, this, &LoginPage::popupConfirmDialog);
    reload();
}

void LoginPage::buildLayout()
{
    auto *buttons = new QVBoxLayout;
    buttons->setSpacing(12);
    mNewButton = makeButton(buttons, I18n::button(8));
    if (protectioncode::isOffered()) {
        mFormButton = makeButton(buttons, I18n::login(3));
        connect(mFormButton, &QAbstractButton::clicked, this, &LoginPage::openForm);
    }
    mExitButton = makeButton(buttons, I18n::button(9));
    buttons->addStretch();
    connect(mNewButton, &QAbstractButton::clicked, this, &LoginPage::startOauth);
    connect(mExitButton, &QAbstractButton::clicked, this, &LoginPage::leave);

    auto *row = new QHBoxLayout;
    row->setSpacing(28);
    row->addWidget(mAccounts, 1);
    row->addWidget(mHint, 1, Qt::AlignTop);
    row->addLayout(buttons);

    mMessage->setFixedHeight(48);
    mMessage->setAlignment(Qt::AlignLeft | Qt::AlignVCenter);
    auto *column = new QVBoxLayout(this);
    column->setContentsMargins(0, 0, 0, 0);
    column->setSpacing(10);
    column->addWidget(makeLabel(this, "title", I18n::prompt(3)));
    column->addLayout(row, 1);
    column->addWidget(mMessage);
}

QAbstractButton *LoginPage::makeButton(QVBoxLayout *column, const QString &text)
{
    auto *button = new PageButton(text, this);
    button->setFixedSize(160, 52);
    column->addWidget(button);
    mButtons << button;
    return button;
}

void LoginPage::reload()
{
    auto *button = qobject_cast<QAbstractButton *>(focusWidget()); // where the user comes back to
    QVector<AccountsWidget::Account> accounts;
    mIsReadable = readAccounts(&accounts);
    if (mIsReadable)
        mAccounts->setAccounts(accounts);
    const bool empty = mAccounts->count() == 0;
    mAccounts->setVisible(!empty);
    mHint->setVisible(empty);
    mHint->setText(AccountTexts::text(mIsReadable ? AccountTexts::NoAccounts
                                                  : AccountTexts::AccountsUnreadable));
    if (button && mButtons.contains(button))
        button->setFocus();
    else
        restoreFocus();
}

void LoginPage::restoreFocus()
{
    if (mAccounts->count() > 0)
        mAccounts->focusCurrent();
    else
        mNewButton->setFocus();
}

bool LoginPage::hasAccount(const QString &mail) const
{
    return mAccounts->contains(mail);
}

void LoginPage::showMessage(const QString &text)
{
    mMessage->setText(text);
}

void LoginPage::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    // Not before: a style sheet that sets a text size keeps the family that was the program's then.
    if (styleSheet().isEmpty())
        setStyleSheet(kStyle + scrollBarStyle());
    // Where it was before, also when another page or window has it at the moment.
    if (QWidget *last = focusWidget())
        last->setFocus();
    else
        restoreFocus();
}

void LoginPage::keyPressEvent(QKeyEvent *event)
{
    logLine("enter LoginPage::keyPressEvent");
    showMessage(QString());
    if (!mIsReadable && mAccounts->count() == 0)
        reload();
    switch (event->key()) {
    case DEVICE_UP_KEY:
        handleUpOrDown(-1);
        break;
    case DEVICE_DOWN_KEY:
        logLine("enter DEVICE_DOWN_KEY");
        handleUpOrDown(1);
        break;
    case DEVICE_LEFT_KEY:
        logLine("enter DEVICE_LEFT_KEY");
        handleLeft();
        break;
    case DEVICE_RIGHT_KEY:
        logLine("enter DEVICE_RIGHT_KEY");
        handleRight();
        break;
    case DEVICE_PAGEUP_KEY:
    case DEVICE_PAGEDOWN_KEY:
        mAccounts->movePage(event->key() == DEVICE_PAGEUP_KEY ? -1 : 1);
        break;
    case DEVICE_SELECT_KEY:
        logLine("enter DEVICE_SELECT_KEY");
        handleSelect();
        break;
    default:
        event->ignore();
    }
}

void LoginPage::handleLeft()
{
    if (mAccounts->hasDeleteFocus())
        mAccounts->focusCurrent();
    else if (!mAccounts->hasRowFocus())
        mAccounts->focusDelete();
}

void LoginPage::handleRight()
{
    if (mAccounts->hasRowFocus())
        mAccounts->focusDelete();
    else if (mAccounts->hasDeleteFocus())
        mNewButton->setFocus();
}

void LoginPage::handleUpOrDown(int rows)
{
    if (mAccounts->hasRowFocus() || mAccounts->hasDeleteFocus())
        mAccounts->moveFocus(rows);
    else
        mButtons.at(qBound(0, focusedButton() + rows, mButtons.size() - 1))->setFocus();
}

int LoginPage::focusedButton() const
{
    int index = 0;
    while (index < mButtons.size() && !mButtons.at(index)->hasFocus())
        ++index;
    return index;
}

void LoginPage::handleSelect()
{
    if (mNewButton->hasFocus())
        startOauth();
    else if (mExitButton->hasFocus())
        leave();
    else if (mFormButton && mFormButton->hasFocus())
        openForm();
    else if (mAccounts->hasDeleteFocus())
        popupConfirmDialog();
    else
        handleSelectIndex();
}

void LoginPage::startOauth()
{
    logLine("has foucus New, emit oauthStarted()");
    emit oauthStarted();
}

void LoginPage::openForm()
{
    emit formWanted(QString());
}

void LoginPage::leave()
{
    logLine("has foucus Exit, exitApp()");
    emit exitApp();
}

LoginPage::Outcome LoginPage::signIn(const QString &mail)
{
    const AccountManagerHelper::Session session;
    const QString pin = AccountManagerHelper::getPassword(mail);
    if (AccountManagerHelper::hasFailed())
        return Failed;
    // An account that is gone has none: that is told, and nothing asked.
    if (protectioncode::isOffered() && !pin.isEmpty() && pin != protectioncode::kDefault)
        return NeedsCode;
    return AccountManagerHelper::login(mail, pin) ? SignedIn : Failed;
}

void LoginPage::handleSelectIndex()
{
    const QString mail = mAccounts->currentAccount();
    if (mail.isEmpty())
        return;
    switch (signIn(mail)) {
    case SignedIn:
        emit loginSucessed();
        break;
    case NeedsCode:
        emit formWanted(mail);
        break;
    case Failed:
        reload();
        showMessage(AccountTexts::text(hasAccount(mail) ? AccountTexts::SignInFailed
                                                        : AccountTexts::AccountGone));
        break;
    }
}

void LoginPage::popupConfirmDialog()
{
    if (mConfirm || mAccounts->currentAccount().isEmpty())
        return;
    mConfirm = new QConfirm(parentWidget() ? parentWidget() : this);
    mConfirm->init(QConfirm::DeleteAccount);
    mConfirm->installEventFilter(this);
    connect(mConfirm, &QConfirm::clickConfirm, this, &LoginPage::handleDeleteAccount);
    connect(mConfirm, &QConfirm::clickCancel, this, &LoginPage::handleDelCancel);
    mConfirm->show();
}

// The question itself knows no Return, which leads back everywhere.
bool LoginPage::eventFilter(QObject *watched, QEvent *event)
{
    const bool isReturn = watched == mConfirm && event->type() == QEvent::KeyPress &&
                          static_cast<QKeyEvent *>(event)->key() == DEVICE_RETURN_KEY;
    if (isReturn)
        handleDelCancel();
    return isReturn || QWidget::eventFilter(watched, event);
}

void LoginPage::handleDelCancel()
{
    closeLater(mConfirm); // the focus goes back to where it was
}

void LoginPage::handleDeleteAccount()
{
    handleDelCancel();
    const QString mail = mAccounts->currentAccount();
    if (mail.isEmpty())
        return;
    bool isDeleted = false;
    {
        const AccountManagerHelper::Session session;
        isDeleted = AccountManagerHelper::removeAccount(mail);
    }
    reload();
    if (!isDeleted)
        showMessage(AccountTexts::text(AccountTexts::NotDeleted));
}
