#include "feeds/tokenendpoint.h"

#include "base/secrets.h"
#include "base/texts.h"
#include "index/tokens.h"

#include <nlohmann/json.hpp>

#include <map>

namespace {

const char knownClientId[] = "583920174652-abcdefghijklmnopqrstuvwxyz";
const char knownClientSecret[] = "Qm7rT2vXk9LpZ4wHs1NdYb8E";

// A browser session may last for days and does not refresh on the way. In milliseconds this still
// fits 32 bits, which is how clients count.
constexpr std::int64_t accessSeconds = 14 * 24 * 3600;

using Form = std::map<std::string, std::string>;

// Read from the body whatever content type it claims: some clients send none.
Form formOf(const std::string &body)
{
    Form form;
    std::size_t start = 0;
    while (start < body.size()) {
        const std::size_t end = std::min(body.find('&', start), body.size());
        std::string part = body.substr(start, end - start);
        for (char &c : part)
            c = c == '+' ? ' ' : c;
        const std::size_t equals = std::min(part.find('='), part.size());
        const std::string name = percentDecoded(part.substr(0, equals));
        form.emplace(name, equals < part.size() ? percentDecoded(part.substr(equals + 1)) : "");
        start = end + 1;
    }
    return form;
}

std::string valueOf(const Form &form, const char *name)
{
    const auto found = form.find(name);
    return found == form.end() ? std::string() : found->second;
}

bool isKnownClient(const Form &form)
{
    const bool idFits = equalSecrets(valueOf(form, "client_id"), knownClientId);
    const bool secretFits = equalSecrets(valueOf(form, "client_secret"), knownClientSecret);
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

} // namespace

TokenEndpoint::TokenEndpoint(Database &database)
    : mDatabase(database)
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
    const Form form = formOf(request.body);
    if (!isKnownClient(form))
        return refuse(response, 401, "invalid_client");
    if (valueOf(form, "grant_type") != "refresh_token")
        return refuse(response, 400, "unsupported_grant_type");
    const auto token = refreshAccess(mDatabase, valueOf(form, "refresh_token"), accessSeconds);
    if (!token)
        return refuse(response, 400, "invalid_grant");
    send(response, 200,
         {{"access_token", *token}, {"expires_in", accessSeconds}, {"token_type", "Bearer"}});
}
