#pragma once

#include <QList>
#include <QModelIndex>
#include <QPointer>
#include <QString>
#include <QWidget>

class AccountList;
class PinLineEdit;
class QAbstractButton;
class QLabel;
class QPopUpForm;
class UserNameLineEdit;

// The account form: a login ID and a PIN of four digits. What Next does depends on the account:
//
//   login ID is stored    --> its PIN is proved, then oauthStarted()
//   chosen from the list  --> it signs in with the PIN: loginSucessed()
//   neither               --> the PIN is entered twice, then oauthStarted()
//
// Whatever goes wrong is told in the tip below the fields, and the PIN starts over.
class ManagerWidget : public QWidget
{
    Q_OBJECT
    Q_PROPERTY(bool olduser READ isOldUser WRITE setOldUser)
    Q_PROPERTY(QString name READ name WRITE setName)
    Q_PROPERTY(QString password READ password WRITE setPassword)

public:
    enum TipType {
        PasswordIncorrect = -2,
        ConfirmPassword = -1,
        PasswordMismatch = 0,
        AccountExists = 1,
    };

    explicit ManagerWidget(QWidget *parent = nullptr);

    bool isOldUser() const { return olduser; }
    void setOldUser(bool isOld) { olduser = isOld; }
    QString name() const { return mName; }
    void setName(const QString &loginId) { mName = loginId; }
    QString password() const { return mPassword; } // the PIN that waits for its confirmation
    void setPassword(const QString &pin) { mPassword = pin; }

    // Asks for the PIN of a stored account, to sign it in.
    void askForCode(const QString &account);

    bool eventFilter(QObject *watched, QEvent *event) override;

signals:
    void loginSucessed();
    void oauthStarted();
    void canceled(); // Cancel or Return

public slots:
    void showAccountList();
    void showInputDialog();
    void getInput(const QString &contents);
    void onCancelClicked();
    void onNextClicked();
    void updateTipMessage(TipType type);
    void retranslateUi();
    void registerEvents();
    void decideAccount();
    void focusNextButton(int pinKey);
    void handleSelectIndex(const QModelIndex &index);
    void cancelSelect();
    void closeInputDialog();

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void showEvent(QShowEvent *event) override;

private:
    // Places in the focus order.
    enum Focus { LoginId = 0, ListButton = 1, FirstPin = 2, Next = 6, Cancel = 7, FocusCount = 8 };

    void buildFields();
    void buildLayout();
    QWidget *widgetAt(int index) const;
    void focusAt(int index);
    void moveFocus(int step);
    bool handleArrow(int key);
    void judgeLoginId();
    void disableNextUntilComplete();
    QString pin() const;
    void clearPin();
    void tell(TipType type);
    void showTip(const QString &text, bool isRed);
    void proveAccount(const QString &pin);
    void signIn(const QString &pin);
    void enterNewPin(const QString &pin);

    bool olduser = false;
    bool mMustProvePin = false; // the login ID is one that is stored
    QString mName;
    QString mPassword;
    int mFocusIndex = LoginId;
    UserNameLineEdit *mLoginId;
    QList<PinLineEdit *> mPinBoxes;
    QAbstractButton *mListButton;
    QAbstractButton *mNextButton;
    QAbstractButton *mCancelButton;
    QLabel *mTitle;
    QLabel *mExplanation;
    QLabel *mLoginIdLabel;
    QLabel *mPinLabel;
    QLabel *mTip;
    QPointer<QPopUpForm> mInputForm;
    QPointer<AccountList> mAccountList;
};
