#pragma once

#include <QString>

class Television;

// One sign-in on the service's pages with the remote, with the focus on the button that leads
// there:
//
//   SignInVisit visit(&tv);
//   visit.open() && visit.fill(mail, password) && visit.submit() && visit.answer(true);
//
// Each step waits for what follows it and is false when that does not come.
class SignInVisit
{
public:
    explicit SignInVisit(Television *tv)
        : mTv(tv)
    {
    }

    bool open() const;   // presses what has the focus
    bool isOpen() const; // when the sign-in page can be used
    // Writes into the first two fields; the focus ends on the second.
    bool fill(const QString &mail, const QString &password) const;
    bool submit() const;            // the button below; until the next page has come
    bool answer(bool allows) const; // on the consent page; until the page has gone

    QString text() const; // what the page says
    bool isAtConsent() const;
    bool hasPanel() const;
    QString digits() const; // in the panel's picture, as a person reads them

private:
    Television *mTv;
};
