#include "accountmanager/managerwidget.h"

#include "accountmanager/accountlist.h"
#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/accounttexts.h"
#include "accountmanager/pagebutton.h"
#include "accountmanager/pinlineedit.h"
#include "accountmanager/usernamelineedit.h"
#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/qpopupform.h"
#include "common/ui/remotekeys.h"

#include <QGridLayout>
#include <QKeyEvent>
#include <QLabel>

namespace {

constexpr int kPinLength = 4;
constexpr int kFieldHeight = 54;

const QString kStyle = QStringLiteral(
    "QLabel {color: white; font-size: 22px;}"
    "QLabel#title {font-size: 28px;}"
    "QLineEdit {color: #f2f6f9; font-size: 24px; padding: 0px 8px;}"
    "QPushButton {border-image: url(:/res/Button_Normal.png) 6; border-width: 6px;"
    " outline-width: 0px; color: white; font-size: 22px;}"
    "QPushButton:focus {border-image: url(:/res/Button_Focus.png) 6; border-width: 6px;}"
    "QPushButton:disabled {color: #75848f;}");

// On a light strip, where both of a tip's colours can be read.
const QString kTipStyle =
    QStringLiteral("color: %1; background: #eef2f5; border-radius: 6px; padding: 6px 14px;");

QLabel *makeLabel(QWidget *parent, const char *name)
{
    auto *label = new QLabel(parent);
    label->setObjectName(QLatin1String(name));
    label->setTextFormat(Qt::PlainText);
    label->setWordWrap(true);
    return label;
}

} // namespace

ManagerWidget::ManagerWidget(QWidget *parent)
    : QWidget(parent)
    , mLoginId(new UserNameLineEdit(this))
    , mListButton(new PageButton(this))
    , mNextButton(new PageButton(this))
    , mCancelButton(new PageButton(this))
    , mTitle(makeLabel(this, "title"))
    , mExplanation(makeLabel(this, "explanation"))
    , mLoginIdLabel(makeLabel(this, "loginId"))
    , mPinLabel(makeLabel(this, "pin"))
    , mTip(makeLabel(this, "tip"))
{
    setStyleSheet(kStyle);
    for (int i = 0; i < kPinLength; ++i)
        mPinBoxes << new PinLineEdit(FirstPin + i, this);
    buildFields();
    buildLayout();
    retranslateUi();
    registerEvents();
    mNextButton->setEnabled(false);
    showTip(I18n::login(7), false);
}

void ManagerWidget::buildFields()
{
    connect(mLoginId, &QLineEdit::returnPressed, this, &ManagerWidget::showInputDialog);
    connect(mLoginId, &UserNameLineEdit::editCompleted, this, &ManagerWidget::decideAccount);
    for (const PinLineEdit *box : qAsConst(mPinBoxes)) {
        connect(box, &QLineEdit::returnPressed, this, &ManagerWidget::showInputDialog);
        connect(box, &PinLineEdit::editCompleted, this, &ManagerWidget::focusNextButton);
    }
    connect(mListButton, &QAbstractButton::clicked, this, &ManagerWidget::showAccountList);
    connect(mNextButton, &QAbstractButton::clicked, this, &ManagerWidget::onNextClicked);
    connect(mCancelButton, &QAbstractButton::clicked, this, &ManagerWidget::onCancelClicked);
}

void ManagerWidget::buildLayout()
{
    for (int i = 0; i < FocusCount; ++i)
        widgetAt(i)->setFixedHeight(kFieldHeight);
    auto *grid = new QGridLayout(this);
    grid->setContentsMargins(0, 0, 0, 0);
    grid->setHorizontalSpacing(14);
    grid->setVerticalSpacing(18);
    grid->addWidget(mTitle, 0, 0, 1, 6);
    grid->addWidget(mExplanation, 1, 0, 1, 6);
    grid->addWidget(mLoginIdLabel, 2, 0);
    grid->addWidget(mLoginId, 2, 1, 1, 4);
    grid->addWidget(mListButton, 2, 5);
    grid->addWidget(mPinLabel, 3, 0);
    for (int i = 0; i < kPinLength; ++i)
        grid->addWidget(mPinBoxes.at(i), 3, 1 + i);
    grid->addWidget(mTip, 4, 0, 1, 6);
    grid->addWidget(mNextButton, 5, 1, 1, 2);
    grid->addWidget(mCancelButton, 5, 3, 1, 2);
    grid->setColumnMinimumWidth(0, 230);
    grid->setColumnMinimumWidth(5, 200);
    grid->setRowStretch(6, 1);
}

void ManagerWidget::retranslateUi()
{
    mTitle->setText(I18n::login(1));
    mExplanation->setText(I18n::login(2));
    mLoginIdLabel->setText(I18n::login(3));
    mLoginId->setPlaceholderText(I18n::login(4));
    mPinLabel->setText(I18n::login(5) + QStringLiteral("\n(") + I18n::login(6) + QLatin1Char(')'));
    mListButton->setText(I18n::prompt(3));
    mNextButton->setText(I18n::button(3));
    mCancelButton->setText(I18n::button(4));
}

// The arrows and Return are the form's, whichever field they are pressed in.
void ManagerWidget::registerEvents()
{
    for (int i = 0; i < FocusCount; ++i)
        widgetAt(i)->installEventFilter(this);
}

QWidget *ManagerWidget::widgetAt(int index) const
{
    switch (index) {
    case LoginId:
        return mLoginId;
    case ListButton:
        return mListButton;
    case Next:
        return mNextButton;
    case Cancel:
        return mCancelButton;
    default:
        return mPinBoxes.at(index - FirstPin);
    }
}

void ManagerWidget::focusAt(int index)
{
    mFocusIndex = index;
    widgetAt(index)->setFocus();
}

// To the next place in that direction that takes the focus; the ends stay.
void ManagerWidget::moveFocus(int step)
{
    for (int index = mFocusIndex + step; index >= 0 && index < FocusCount; index += step) {
        if (widgetAt(index)->isEnabled())
            return focusAt(index);
    }
}

bool ManagerWidget::handleArrow(int key)
{
    const bool isPin = mFocusIndex >= FirstPin && mFocusIndex < Next;
    switch (key) {
    case DEVICE_LEFT_KEY:
        moveFocus(-1);
        return true;
    case DEVICE_RIGHT_KEY:
        moveFocus(1);
        return true;
    case DEVICE_UP_KEY:
        focusAt(mFocusIndex >= Next ? FirstPin : LoginId);
        return true;
    case DEVICE_DOWN_KEY:
        if (mFocusIndex < FirstPin)
            focusAt(FirstPin);
        else if (isPin)
            focusAt(mNextButton->isEnabled() ? Next : Cancel);
        return true;
    default:
        return false;
    }
}

bool ManagerWidget::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() == QEvent::FocusIn) {
        for (int i = 0; i < FocusCount; ++i) {
            if (watched == widgetAt(i))
                mFocusIndex = i;
        }
    }
    if (event->type() != QEvent::KeyPress)
        return QWidget::eventFilter(watched, event);
    const int key = static_cast<QKeyEvent *>(event)->key();
    if (key == DEVICE_RETURN_KEY) {
        onCancelClicked();
        return true;
    }
    return handleArrow(key) || QWidget::eventFilter(watched, event);
}

void ManagerWidget::keyPressEvent(QKeyEvent *event)
{
    if (event->key() != DEVICE_SELECT_KEY) {
        event->ignore();
        return;
    }
    if (mFocusIndex == LoginId)
        showInputDialog();
    else if (auto *button = qobject_cast<QAbstractButton *>(widgetAt(mFocusIndex)))
        button->click();
}

void ManagerWidget::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    focusAt(mFocusIndex);
}

void ManagerWidget::showInputDialog()
{
    closeInputDialog();
    mInputForm = new QPopUpForm(window());
    mInputForm->initForm(QPopUpForm::POPUP_FORM_TEXT_INPUT,
                         mFocusIndex == LoginId ? mLoginId->text() : QString());
    mInputForm->setInputMode(mFocusIndex != LoginId);
    connect(mInputForm, &QPopUpForm::returnPopUpForm, this, &ManagerWidget::closeInputDialog);
    connect(mInputForm, &QPopUpForm::editFinished, this, &ManagerWidget::getInput);
    mInputForm->show();
}

void ManagerWidget::closeInputDialog()
{
    if (!mInputForm)
        return;
    mInputForm->hide();
    mInputForm->deleteLater();
    mInputForm.clear();
}

void ManagerWidget::getInput(const QString &contents)
{
    closeInputDialog();
    if (mFocusIndex == LoginId) {
        mLoginId->setInput(contents);
        return;
    }
    const bool isPin = mFocusIndex >= FirstPin && mFocusIndex < Next;
    const QChar first = contents.isEmpty() ? QChar() : contents.at(0);
    if (isPin && first >= QLatin1Char('0') && first <= QLatin1Char('9'))
        mPinBoxes.at(mFocusIndex - FirstPin)->setDigit(first);
}

void ManagerWidget::onCancelClicked()
{
    mPassword.clear();
    clearPin();
    emit canceled();
}

void ManagerWidget::decideAccount()
{
    showTip(I18n::login(7), false);
    mMustProvePin = false;
    olduser = false;
    mPassword.clear(); // it was another account's
    if (mLoginId->text().isEmpty())
        return;
    focusAt(FirstPin);
    const AccountManagerHelper::Session session;
    if (AccountManagerHelper::getAccounts(true).contains(mLoginId->text())) {
        updateTipMessage(AccountExists);
        mMustProvePin = true;
    }
}

void ManagerWidget::focusNextButton(int pinKey)
{
    logLine("ManagerWidget::focusNextButton,  pinKey = ", pinKey);
    const bool isComplete = pin().size() == kPinLength;
    mNextButton->setEnabled(isComplete);
    if (pinKey + 1 < Next)
        focusAt(pinKey + 1);
    else if (isComplete)
        focusAt(Next);
}

void ManagerWidget::onNextClicked()
{
    const QString typed = pin();
    const AccountManagerHelper::Session session;
    mName = mLoginId->text();
    if (mMustProvePin)
        proveAccount(typed);
    else if (olduser)
        signIn(typed);
    else
        enterNewPin(typed);
}

void ManagerWidget::proveAccount(const QString &typed)
{
    const QString stored = AccountManagerHelper::getPassword(mName);
    if (AccountManagerHelper::hasFailed()) {
        clearPin();
        showTip(AccountTexts::text(AccountTexts::AccountsUnreadable), true);
    } else if (stored != typed) {
        tell(PasswordIncorrect);
    } else {
        mPassword = typed;
        emit oauthStarted();
    }
}

void ManagerWidget::signIn(const QString &typed)
{
    mPassword = typed;
    if (AccountManagerHelper::login(mName, mPassword))
        emit loginSucessed();
    else
        tell(PasswordIncorrect);
}

void ManagerWidget::enterNewPin(const QString &typed)
{
    if (mPassword.isEmpty()) {
        mPassword = typed;
        tell(ConfirmPassword);
    } else if (typed != mPassword) {
        tell(PasswordMismatch);
    } else {
        emit oauthStarted();
    }
}

// The tip, and the PIN starts over.
void ManagerWidget::tell(TipType type)
{
    updateTipMessage(type);
    clearPin();
    focusAt(FirstPin);
}

QString ManagerWidget::pin() const
{
    QString digits;
    for (const PinLineEdit *box : mPinBoxes)
        digits += box->digit();
    return digits;
}

void ManagerWidget::clearPin()
{
    for (PinLineEdit *box : qAsConst(mPinBoxes))
        box->clearDigit();
    focusAt(FirstPin); // a disabled button would lose it
    mNextButton->setEnabled(false);
}

void ManagerWidget::updateTipMessage(TipType type)
{
    QString text = mTip->text();
    if (type >= PasswordIncorrect && type <= AccountExists)
        text = I18n::login(8 + type - PasswordIncorrect);
    showTip(text, true);
}

void ManagerWidget::showTip(const QString &text, bool isRed)
{
    mTip->setStyleSheet(kTipStyle.arg(isRed ? QStringLiteral("#c00000") : QStringLiteral("black")));
    mTip->setText(text);
}

void ManagerWidget::showAccountList()
{
    QStringList accounts;
    {
        const AccountManagerHelper::Session session;
        accounts = AccountManagerHelper::getAccounts(true);
    }
    if (accounts.isEmpty()) {
        showTip(AccountTexts::text(AccountTexts::NoAccounts), true);
        return;
    }
    mAccountList = new AccountList(accounts, window());
    connect(mAccountList, &AccountList::selected, this, &ManagerWidget::handleSelectIndex);
    connect(mAccountList, &AccountList::returned, this, &ManagerWidget::cancelSelect);
    mAccountList->show();
}

// An account of the list signs in by its PIN; its login ID may be longer than one that is typed.
void ManagerWidget::handleSelectIndex(const QModelIndex &index)
{
    const QString account = index.data().toString();
    cancelSelect();
    mLoginId->showAccount(account);
    mMustProvePin = false;
    olduser = true;
    mPassword.clear();
    showTip(I18n::login(7), false);
    clearPin();
}

void ManagerWidget::cancelSelect()
{
    if (!mAccountList)
        return;
    mAccountList->hide();
    mAccountList->deleteLater();
    mAccountList.clear();
}
