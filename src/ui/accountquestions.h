#pragma once

#include <QObject>
#include <QPointer>

class QWidget;

// The questions after which the user may be led back to the accounts. One at a time.
class AccountQuestions : public QObject
{
    Q_OBJECT

public:
    // The screen is what the questions pop up over.
    explicit AccountQuestions(QWidget *screen);

    // Whether to sign out.
    void askToSignOut();
    // The service refused a page, for the reason given as plain text: whether to sign in again.
    void askAfterRefusal(const QString &reason);

signals:
    void confirmed();
    void canceled();

private:
    void show(QWidget *question);
    void answer(bool confirms);

    QWidget *mScreen;
    QPointer<QWidget> mQuestion;
};
