#pragma once

#include <QString>

// The account screens' own texts: what they say beyond the wording of I18n.
class AccountTexts
{
public:
    enum Text {
        NoAccounts = 0,
        AccountGone = 1,
        SignInFailed = 2,
        AccountsUnreadable = 3,
        SignInUnavailable = 4,
        NotStored = 5,
        NotDeleted = 6,
        NoAccountWithCode = 7,
    };

    // The text, or "Unknown" for an index that has none.
    static QString text(int index);
};
