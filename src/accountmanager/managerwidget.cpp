#include "accountmanager/managerwidget.h"

#include "accountmanager/accountlist.h"
#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/accounttexts.h"
#include "accountmanager/pagebutton.h"
#include "accountmanager/pinlineedit.h"
#include "accountmanager/protectioncode.h"
#include "accountmanager/usernamelineedit.h"
#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/closelater.h"
#include "common/ui/qpopupform.h"

#include <QGridLayout>
#include <QLabel>

namespace {

constexpr int kPinLength = 4;
constexpr int kFieldHeight = 54;
constexpr int kPinWidth = 78;
constexpr int kLabelWidth = 210;
constexpr int kListWidth = 180;

const QString kStyle = QStringLiteral(
    "QLabel {color: white; font-size: 22px;}"
    "QLabel#title {font-size: 28px;}"
    "QLineEdit {font-size: 24px;}"
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

// The accounts that somebody has given a code. When there are none, the text that says why
// (AccountTexts), else -1.
int readAccountsWithCode(QStringList *accounts)
{
    const AccountManagerHelper::Session session;
    const QStringList stored = AccountManagerHelper::getAccounts(true);
    if (AccountManagerHelper::hasFailed())
        return AccountTexts::AccountsUnreadable;
    for (const QString &account : stored) {
        if (AccountManagerHelper::getPassword(account) != protectioncode::kDefault)
            accounts->append(account);
    }
    return accounts->isEmpty() ? AccountTexts::NoAccountWithCode : -1;
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
    connect(mLoginId, &UserNameLineEdit::typed, this, &ManagerWidget::judgeLoginId);
    for (const PinLineEdit *box : qAsConst(mPinBoxes)) {
        connect(box, &QLineEdit::returnPressed, this, &ManagerWidget::showInputDialog);
        connect(box, &PinLineEdit::editCompleted, this, &ManagerWidget::focusNextButton);
        connect(box, &QLineEdit::textChanged, this, &ManagerWidget::disableNextUntilComplete);
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
    for (int i = 0; i < kPinLength; ++i) {
        mPinBoxes.at(i)->setFixedWidth(kPinWidth);
        grid->addWidget(mPinBoxes.at(i), 3, 1 + i);
    }
    grid->addWidget(mTip, 4, 0, 1, 6);
    grid->addWidget(mNextButton, 5, 1, 1, 2);
    grid->addWidget(mCancelButton, 5, 3, 1, 2);
    grid->setColumnMinimumWidth(0, kLabelWidth);
    grid->setColumnMinimumWidth(5, kListWidth);
    grid->setColumnStretch(5, 1);
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
    closeLater(mInputForm);
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
    judgeLoginId();
    if (!mLoginId->text().isEmpty())
        focusAt(FirstPin);
}

// Whether the login ID is a stored account, whose PIN has to be proved.
void ManagerWidget::judgeLoginId()
{
    showTip(I18n::login(7), false);
    mMustProvePin = false;
    olduser = false;
    mPassword.clear(); // it was another account's
    if (mLoginId->text().isEmpty())
        return;
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

// A digit that is deleted makes the PIN wait again.
void ManagerWidget::disableNextUntilComplete()
{
    if (pin().size() < kPinLength)
        mNextButton->setEnabled(false);
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
    focusAt(FirstPin); // the button that is disabled would lose it
    for (PinLineEdit *box : qAsConst(mPinBoxes))
        box->clearDigit();
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
    const int failure = readAccountsWithCode(&accounts);
    if (failure >= 0) {
        showTip(AccountTexts::text(failure), true);
        return;
    }
    mAccountList = new AccountList(accounts, window());
    connect(mAccountList, &AccountList::selected, this, &ManagerWidget::handleSelectIndex);
    connect(mAccountList, &AccountList::returned, this, &ManagerWidget::cancelSelect);
    mAccountList->show();
}

void ManagerWidget::handleSelectIndex(const QModelIndex &index)
{
    const QString account = index.data().toString();
    cancelSelect();
    askForCode(account);
}

// The login ID of a stored account may be longer than one that is typed.
void ManagerWidget::askForCode(const QString &account)
{
    mLoginId->showAccount(account);
    mMustProvePin = false;
    olduser = true;
    mPassword.clear();
    showTip(I18n::login(7), false);
    clearPin();
}

void ManagerWidget::cancelSelect()
{
    closeLater(mAccountList);
}
