#include "signin/tokenendpoint.h"

#include "index/database.h"
#include "index/tokens.h"
#include "index/users.h"

#include <nlohmann/json.hpp>

namespace {

bool isKnownClient(const Form &form)
{
    const bool idFits = equalSecrets(form.value("client_id"), knownClientId);
    const bool secretFits = equalSecrets(form.value("client_secret"), knownClientSecret);
    return idFits && secretFits;
}

void send(httplib::Response &response, int status, const nlohmann::json &body)
{
    response.status = status;
    response.set_header("Cache-Control", "no-store");
    response.set_content(body.dump(), "application/json; charset=UTF-8");
}

void refuse(httplib::Response &response, int status, const char *error)
{
    send(response, status, {{"error", error}});
}

bool isThere(Database &database, std::int64_t userId)
{
    auto reader = database.read();
    return userWithId(reader, userId).has_value();
}

} // namespace

TokenEndpoint::TokenEndpoint(Database &database, AuthorisationCodes &codes,
                             std::int64_t accessSeconds)
    : mDatabase(database)
    , mCodes(codes)
    , mAccessSeconds(accessSeconds)
{
}

void TokenEndpoint::addRoutes(Router &router)
{
    router.add("POST", "o/oauth2/token",
               [this](const Router::Call &call, httplib::Response &response) {
                   answer(call.request, response);
               });
}

void TokenEndpoint::answer(const httplib::Request &request, httplib::Response &response)
{
    const Form form(request.body);
    if (!isKnownClient(form))
        return refuse(response, 401, "invalid_client");
    const std::string grant = form.value("grant_type");
    if (grant == "authorization_code")
        exchange(form, response);
    else if (grant == "refresh_token")
        refresh(form, response);
    else
        refuse(response, 400, "unsupported_grant_type");
}

void TokenEndpoint::exchange(const Form &form, httplib::Response &response)
{
    const auto approval = mCodes.take(form.value("code"));
    if (!approval || approval->clientId != form.value("client_id") ||
        approval->redirectUri != form.value("redirect_uri"))
        return refuse(response, 400, "invalid_grant");
    if (!isThere(mDatabase, approval->userId))
        return refuse(response, 400, "invalid_grant");
    const Tokens tokens = issueTokens(mDatabase, approval->userId, mAccessSeconds);
    send(response, 200,
         {{"access_token", tokens.access},
          {"refresh_token", tokens.refresh},
          {"expires_in", tokens.expiresIn},
          {"token_type", "Bearer"}});
}

void TokenEndpoint::refresh(const Form &form, httplib::Response &response)
{
    const auto token = refreshAccess(mDatabase, form.value("refresh_token"), mAccessSeconds);
    if (!token)
        return refuse(response, 400, "invalid_grant");
    send(response, 200,
         {{"access_token", *token}, {"expires_in", mAccessSeconds}, {"token_type", "Bearer"}});
}
