#include "signin/signinpages.h"

#include "base/texts.h"
#include "index/database.h"
#include "index/passwords.h"
#include "index/users.h"
#include "signin/digitpicture.h"
#include "signin/pages.h"

namespace {

const char cookieName[] = "orvala_visit";
const char authorisePath[] = "/o/oauth2/auth?";
constexpr std::chrono::minutes sessionLife{5};
constexpr std::chrono::minutes panelLife{10};
constexpr std::size_t visitBytes = 32;
constexpr std::size_t longestMail = 254;
constexpr std::size_t longestTarget = 2000;
constexpr int panelDigits = 5;

void sendPage(httplib::Response &response, int status, const std::string &page)
{
    response.status = status;
    response.set_header("Cache-Control", "no-store");
    response.set_header("X-Frame-Options", "DENY");
    response.set_header("Referrer-Policy", "no-referrer");
    response.set_header("Content-Security-Policy",
                        "default-src 'none'; style-src 'unsafe-inline'; script-src "
                        "'unsafe-inline'; form-action 'self'; frame-ancestors 'none'");
    response.set_content(page, "text/html; charset=UTF-8");
}

void sendTo(httplib::Response &response, int status, const std::string &target)
{
    response.status = status;
    response.set_header("Cache-Control", "no-store");
    response.set_header("Location", target);
}

// The visitor's cookie; empty for a first visit.
std::string visitOf(const httplib::Request &request)
{
    const std::string line = "; " + request.get_header_value("Cookie");
    const std::string start = std::string("; ") + cookieName + "=";
    const std::size_t found = line.find(start);
    if (found == std::string::npos)
        return {};
    const std::size_t value = found + start.size();
    return line.substr(value, line.find(';', value) - value);
}

// Only a page that was given to the same visitor knows it.
std::string formTokenOf(const std::string &visit)
{
    return fingerprint("form of " + visit);
}

bool isOwnForm(const httplib::Request &request, const Form &form)
{
    const std::string visit = visitOf(request);
    return !visit.empty() && equalSecrets(form.value("form"), formTokenOf(visit));
}

// Never an address elsewhere.
bool isContinuation(const std::string &target)
{
    return target.rfind(authorisePath, 0) == 0 && target.size() <= longestTarget &&
           target.find_first_of("\r\n\\") == std::string::npos;
}

// Empty when the program may ask.
std::string problemOf(const Form &query)
{
    if (query.value("client_id") != knownClientId)
        return "This program is not known here.";
    if (query.value("redirect_uri") != outOfBand || query.value("response_type") != "code")
        return "This program asks in a way that is not known here.";
    return {};
}

std::string waitText(std::chrono::seconds wait)
{
    const auto minutes = std::chrono::ceil<std::chrono::minutes>(wait).count();
    return "Too many wrong tries. Please wait " + std::to_string(minutes) +
           (minutes == 1 ? " minute." : " minutes.");
}

Attempts::Who whoAsks(const httplib::Request &request, const Form &form)
{
    return {form.value("mail").substr(0, longestMail), request.remote_addr};
}

} // namespace

SignInPages::SignInPages(Database &database, AuthorisationCodes &codes, const Settings &settings)
    : mDatabase(database)
    , mCodes(codes)
    , mWithTls(settings.withTls)
    , mAttempts(settings.attempts, settings.now)
    , mSessions(sessionLife, settings.now)
    , mPanels(panelLife, settings.now)
{
}

void SignInPages::addRoutes(Router &router)
{
    const auto to = [this](void (SignInPages::*answer)(const Request &, Response &)) {
        return [this, answer](const Router::Call &call, Response &response) {
            (this->*answer)(call.request, response);
        };
    };
    router.add("GET", "o/oauth2/auth", to(&SignInPages::authorise));
    router.add("GET", "ServiceLogin", to(&SignInPages::showSignIn));
    router.add("POST", "ServiceLogin", to(&SignInPages::signIn));
    router.add("POST", "o/oauth2/approve", to(&SignInPages::approve));
}

void SignInPages::authorise(const Request &request, Response &response)
{
    const std::size_t mark = request.target.find('?');
    const Form query(mark == std::string::npos ? "" : request.target.substr(mark + 1));
    const std::string problem = problemOf(query);
    if (!problem.empty())
        return sendPage(response, 400, errorPage(problem));
    const auto user = signedIn(request);
    if (!user)
        return sendTo(response, 302, "/ServiceLogin?continue=" + percentEncoded(request.target));
    const std::string name =
        user->name.find_first_not_of(" \t\r\n") == std::string::npos ? user->mail : user->name;
    sendPage(response, 200,
             consentPage({formTokenOf(visitOf(request)), query.value("client_id"),
                          query.value("redirect_uri"), validUtf8(name)}));
}

void SignInPages::showSignIn(const Request &request, Response &response)
{
    const std::size_t mark = request.target.find('?');
    askAgain(request, response,
             Form(mark == std::string::npos ? "" : request.target.substr(mark + 1)), "");
}

// Shows the form, with what was typed before except the password.
void SignInPages::askAgain(const Request &request, Response &response, const Form &form,
                           const std::string &message)
{
    SignInForm page;
    page.continueTo = form.value("continue");
    if (!isContinuation(page.continueTo))
        return sendPage(response, 400, errorPage("Please start the sign-in from your screen."));
    std::string visit = visitOf(request);
    if (visit.empty()) {
        visit = randomText(visitBytes);
        setCookie(response, visit);
    }
    const Attempts::Who who = whoAsks(request, form);
    page.formToken = formTokenOf(visit);
    page.mail = validUtf8(who.mail);
    page.message = message;
    if (mAttempts.needsPanel(who)) {
        const std::string digits = randomDigits(panelDigits);
        page.challenge = mPanels.add(digits);
        page.picture = digitPicture(digits);
    }
    sendPage(response, 200, signInPage(page));
}

void SignInPages::signIn(const Request &request, Response &response)
{
    const Form form(request.body);
    if (!isOwnForm(request, form))
        return askAgain(request, response, form, "This page was too old. Please try again.");
    const Attempts::Who who = whoAsks(request, form);
    const auto wait = mAttempts.blockedFor(who);
    if (wait.count() > 0) {
        askAgain(request, response, form, waitText(wait));
        response.status = 429;
        return response.set_header("Retry-After", std::to_string(wait.count()));
    }
    std::string message;
    if (!isPanelPassed(form, who, &message))
        return askAgain(request, response, form, message);
    const auto user = userWithPassword(mDatabase, form.value("mail"), form.value("password"));
    if (!user) {
        mAttempts.noteWrong(who);
        return askAgain(request, response, form, "E-mail or password is wrong.");
    }
    const std::string target = form.value("continue");
    if (!isContinuation(target))
        return sendPage(response, 400, errorPage("Please start the sign-in from your screen."));
    mAttempts.noteRight(who);
    setCookie(response, mSessions.add(user->id)); // a new one: nobody can have planted it
    sendTo(response, 303, target);
}

bool SignInPages::isPanelPassed(const Form &form, const Attempts::Who &who, std::string *message)
{
    if (!mAttempts.needsPanel(who))
        return true;
    const auto digits = mPanels.take(form.value("challenge"));
    if (digits && equalSecrets(*digits, form.value("digits")))
        return true;
    *message = "Please type the digits in the picture too.";
    if (digits && !form.value("digits").empty()) {
        mAttempts.noteWrong(who);
        *message = "These were not the digits in the picture.";
    }
    return false;
}

void SignInPages::approve(const Request &request, Response &response)
{
    const Form form(request.body);
    const auto user = signedIn(request);
    if (!user || !isOwnForm(request, form) || form.value("client_id") != knownClientId ||
        form.value("redirect_uri") != outOfBand)
        return sendPage(response, 403, errorPage("This page was too old. Please start again."));
    mSessions.take(visitOf(request));
    setCookie(response, "");
    if (form.value("answer") != "allow")
        return sendPage(response, 200,
                        resultPage("Denied error=access_denied", "Nothing was allowed."));
    const std::string code =
        mCodes.add({user->id, form.value("client_id"), form.value("redirect_uri")});
    sendPage(response, 200, resultPage("Success code=" + code, "Welcome, " + user->name + "."));
}

std::optional<UserRecord> SignInPages::signedIn(const Request &request)
{
    const auto userId = mSessions.find(visitOf(request));
    if (!userId)
        return std::nullopt;
    auto reader = mDatabase.read();
    return userWithId(reader, *userId);
}

// An empty value takes the cookie back.
void SignInPages::setCookie(Response &response, const std::string &value) const
{
    std::string cookie = std::string(cookieName) + "=" + value + "; Path=/; HttpOnly; SameSite=Lax";
    if (mWithTls)
        cookie += "; Secure";
    if (value.empty())
        cookie += "; Max-Age=0";
    response.set_header("Set-Cookie", cookie);
}
