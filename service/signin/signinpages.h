#pragma once

#include "http/form.h"
#include "http/router.h"
#include "index/records.h"
#include "signin/attempts.h"
#include "signin/tokenendpoint.h"

// The pages on which somebody signs in and allows a program to act for them:
//
//   o/oauth2/auth?... --(not signed in)--> ServiceLogin --(right password)--.
//        |  ^---------------------------------------------------------------'
//        '--> consent --> o/oauth2/approve: the result, with a one-time code in its title
//
// Being signed in lasts until the answer, or for some minutes: the next person at the same screen
// starts anew. A form counts only with the token that its page was given for the visitor's cookie.
class SignInPages
{
public:
    struct Settings
    {
        bool withTls = true;
        Attempts::Limits attempts;
        Now now = SteadyClock::now;
    };

    SignInPages(Database &database, AuthorisationCodes &codes, const Settings &settings);
    void addRoutes(Router &router);

private:
    using Request = httplib::Request;
    using Response = httplib::Response;

    void authorise(const Request &request, Response &response);
    void showSignIn(const Request &request, Response &response);
    void signIn(const Request &request, Response &response);
    void approve(const Request &request, Response &response);

    void askAgain(const Request &request, Response &response, const Form &form,
                  const std::string &message);
    bool isPanelPassed(const Form &form, const Attempts::Who &who, std::string *message);
    std::optional<UserRecord> signedIn(const Request &request);
    void setCookie(Response &response, const std::string &value) const;

    Database &mDatabase;
    AuthorisationCodes &mCodes;
    const bool mWithTls;
    Attempts mAttempts;
    ShortLived<std::int64_t> mSessions; // ids of users
    ShortLived<std::string> mPanels;    // digits to be read
};
