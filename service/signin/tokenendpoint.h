#pragma once

#include "http/form.h"
#include "http/router.h"
#include "signin/clients.h"
#include "signin/shortlived.h"

class Database;

using AuthorisationCodes = ShortLived<Approval>;

// The OAuth 2.0 token endpoint, "o/oauth2/token". A known client gets tokens for a one-time code
// from the sign-in pages, and a new access token for a refresh token, which stays as it is and is
// not sent again. An access token is good for `accessSeconds`.
class TokenEndpoint
{
public:
    TokenEndpoint(Database &database, AuthorisationCodes &codes, std::int64_t accessSeconds);
    void addRoutes(Router &router);

private:
    void answer(const httplib::Request &request, httplib::Response &response);
    void exchange(const Form &form, httplib::Response &response);
    void refresh(const Form &form, httplib::Response &response);

    Database &mDatabase;
    AuthorisationCodes &mCodes;
    const std::int64_t mAccessSeconds;
};
