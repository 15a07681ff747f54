#pragma once

#include "http/router.h"

class Database;

// The OAuth 2.0 token endpoint, "o/oauth2/token": a refresh token of a known client buys a new
// access token. The refresh token stays as it is and is not sent again.
class TokenEndpoint
{
public:
    explicit TokenEndpoint(Database &database);
    void addRoutes(Router &router);

private:
    void answer(const httplib::Request &request, httplib::Response &response);

    Database &mDatabase;
};
