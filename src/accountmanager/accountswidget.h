#pragma once

#include <QScrollArea>
#include <QString>
#include <QVector>

class AccountItem;
class QVBoxLayout;

// The list of stored accounts, one row each, scrolled by whole rows so that the focused one is in
// view. The page that owns it handles the keys.
class AccountsWidget : public QScrollArea
{
    Q_OBJECT

public:
    struct Account
    {
        QString mail;
        QString name;
    };

    explicit AccountsWidget(QWidget *parent = nullptr);

    // Replaces the rows; the current account stays the current one if it is still there, else the
    // one that has taken its place becomes it.
    void setAccounts(const QVector<Account> &accounts);
    bool contains(const QString &mail) const;
    int count() const { return mItems.size(); }

    // The row that has the focus or had it last; an empty address when there is none.
    QString currentAccount() const;
    void focusCurrent();
    void focusDelete(); // the current row's button
    // Moves the focus by so many rows, as far as there are rows, on the buttons from one to
    // another.
    void moveFocus(int rows);
    void movePage(int pages);
    bool hasRowFocus() const;
    bool hasDeleteFocus() const;

    QSize sizeHint() const override;

signals:
    // The row that is now the current one, or its button, was chosen with the pointer.
    void accountChosen();
    void deletionChosen();

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    void addRow(const Account &account);
    void scrollToCurrent();

    QVBoxLayout *mRows;
    QVector<AccountItem *> mItems;
    int mCurrent = 0;
};
