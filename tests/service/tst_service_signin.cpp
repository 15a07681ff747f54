#include "support/testservice.h"

#include "base/texts.h"
#include "index/passwords.h"
#include "index/users.h"
#include "signin/attempts.h"
#include "signin/pages.h"

#include <gtest/gtest.h>

namespace {

const char client[] = "client_id=583920174652-abcdefghijklmnopqrstuvwxyz&redirect_uri="
                      "urn:ietf:wg:oauth:2.0:oob";
const char secret[] = "&client_secret=Qm7rT2vXk9LpZ4wHs1NdYb8E";
const char formType[] = "application/x-www-form-urlencoded";

// What stands between two texts, the first time.
std::string between(const std::string &text, const std::string &start, const std::string &end)
{
    const std::size_t from = text.find(start);
    if (from == std::string::npos)
        return {};
    const std::size_t begin = from + start.size();
    return text.substr(begin, text.find(end, begin) - begin);
}

// Somebody at a web view: keeps the cookie and the last page, follows where it is sent.
class Visitor
{
public:
    explicit Visitor(int port)
        : mClient("127.0.0.1", port)
    {
    }

    void open(const std::string &target) { take(mClient.Get(target, headers()), target); }
    void submit(const std::string &action, const std::string &fields)
    {
        std::string body = fields;
        for (const char *name : {"form", "continue", "client_id", "redirect_uri", "challenge"})
            body += std::string("&") + name + "=" + fieldValue(name);
        take(mClient.Post(action, headers(), body, formType), action);
    }
    void start()
    {
        open("/o/oauth2/auth?" + std::string(client) +
             "&scope=https://127.0.0.1:1/data/&response_type=code");
    }
    void signIn(const std::string &mail, const std::string &password)
    {
        submit("/ServiceLogin", "mail=" + mail + "&password=" + password);
    }
    bool hasPanel() const { return page.find("id=\"logincaptcha\"") != std::string::npos; }
    std::string title() const { return between(page, "<title>", "</title>"); }

    std::string page;
    std::string path;
    std::string cookie;
    int status = 0;

private:
    httplib::Headers headers() const { return {{"Cookie", cookie}}; }
    std::string fieldValue(const std::string &name) const
    {
        std::string value = between(page, "name=\"" + name + "\" value=\"", "\"");
        for (std::size_t at = 0; (at = value.find("&amp;", at)) != std::string::npos; ++at)
            value.erase(at + 1, 4);
        return percentEncoded(value);
    }
    // The HTTP library hands out header lines decoded.
    static std::string encoded(const std::string &target)
    {
        const std::string start = "/ServiceLogin?continue=";
        return target.rfind(start, 0) == 0 ? start + percentEncoded(target.substr(start.size()))
                                           : target;
    }
    void take(const httplib::Result &answer, const std::string &target)
    {
        ASSERT_TRUE(answer);
        status = answer->status;
        path = target;
        page = answer->body;
        const std::string set = answer->get_header_value("Set-Cookie");
        if (!set.empty())
            cookie = set.substr(0, set.find(';'));
        if (status / 100 == 3)
            open(encoded(answer->get_header_value("Location")));
    }

    httplib::Client mClient;
};

class SignIn : public testing::Test, protected TestService
{
protected:
    void SetUp() override
    {
        start();
        addUser("ben@orvala.example", "Ben <b>&amp; Co", "ben");
        setPassword(database(), "anna@orvala.example", "mountains");
        setPassword(database(), "ben@orvala.example", "nut & hatch");
    }
    std::unique_ptr<Visitor> visitor()
    {
        auto visitor = std::make_unique<Visitor>(service().port());
        visitor->start();
        return visitor;
    }
    httplib::Result exchange(const std::string &code, const std::string &known = client)
    {
        httplib::Client http("127.0.0.1", service().port());
        return http.Post("/o/oauth2/token",
                         "code=" + code + "&" + known + secret + "&grant_type=authorization_code",
                         "");
    }
};

} // namespace

TEST_F(SignIn, theNextPersonSignsInAnew)
{
    const auto visitor = this->visitor();
    visitor->signIn("anna@orvala.example", "mountains");
    const std::string used = visitor->cookie;
    visitor->submit("/o/oauth2/approve", "answer=deny");
    EXPECT_EQ(visitor->title(), "Denied error=access_denied");
    for (const std::string &cookie : {visitor->cookie, used}) {
        visitor->cookie = cookie;
        visitor->start();
        EXPECT_EQ(visitor->path.rfind("/ServiceLogin", 0), 0u);
    }
    visitor->signIn("ben@orvala.example", "nut+%26+hatch");
    EXPECT_EQ(between(visitor->page, "<p class=\"name\">", "</p>"), "Ben &lt;b&gt;&amp;amp; Co");
}

TEST_F(SignIn, codesAreBoundToWhatWasAllowed)
{
    const auto visitor = this->visitor();
    const auto code = [&] {
        visitor->start();
        visitor->signIn("Anna@orvala.example", "mountains");
        visitor->submit("/o/oauth2/approve", "answer=allow");
        return visitor->title().substr(std::string("Success code=").size());
    };
    const std::string used = code();
    const auto answer = exchange(used);
    ASSERT_EQ(answer->status, 200);
    const json tokens = json::parse(answer->body);
    EXPECT_EQ(tokens["expires_in"], 90 * 24 * 3600);
    EXPECT_EQ(tokens["token_type"], "Bearer");
    EXPECT_NE(tokens["refresh_token"], tokens["access_token"]);
    EXPECT_EQ(json::parse(exchange(used)->body)["error"], "invalid_grant"); // once only
    std::string elsewhere = client;
    elsewhere.replace(elsewhere.find("urn:"), std::string::npos, "https://x.example/");
    const std::string tried = code();
    EXPECT_EQ(exchange(tried, elsewhere)->status, 400);
    EXPECT_EQ(exchange(tried)->status, 400); // whoever tried has spent it
    EXPECT_EQ(exchange("")->status, 400);
    const std::string last = code();
    removeUser(database(), "anna@orvala.example");
    EXPECT_EQ(exchange(last)->status, 400);
}

TEST_F(SignIn, wrongTriesBringThePanelAndThenAPause)
{
    const auto visitor = this->visitor();
    for (int i = 0; i < 3; ++i) {
        EXPECT_FALSE(visitor->hasPanel());
        visitor->signIn("anna@orvala.example", "wrong" + std::to_string(i));
        EXPECT_EQ(visitor->path, "/ServiceLogin");
        EXPECT_NE(visitor->page.find("E-mail or password is wrong."), std::string::npos);
        EXPECT_NE(visitor->page.find("value=\"anna@orvala.example\""), std::string::npos);
    }
    ASSERT_TRUE(visitor->hasPanel());
    const auto fresh = this->visitor(); // without the cookie it is the same device
    EXPECT_TRUE(fresh->hasPanel());
    fresh->signIn("anna@orvala.example", "mountains");
    EXPECT_NE(fresh->page.find("type the digits"), std::string::npos);
    for (int i = 0; i < 7; ++i)
        fresh->submit("/ServiceLogin", "mail=anna@orvala.example&password=mountains&digits=x");
    EXPECT_EQ(fresh->status, 200);
    fresh->signIn("anna@orvala.example", "mountains");
    EXPECT_EQ(fresh->status, 429);
    EXPECT_NE(fresh->page.find("Please wait 10 minutes."), std::string::npos);
}

TEST_F(SignIn, foreignFormsAndOddAddressesAreRefused)
{
    const auto visitor = this->visitor();
    visitor->cookie = "a=b; orvala_visit=planted";
    visitor->signIn("anna@orvala.example", "mountains");
    EXPECT_NE(visitor->page.find("too old"), std::string::npos);
    visitor->cookie = "";
    visitor->submit("/o/oauth2/approve", "answer=allow");
    EXPECT_EQ(visitor->status, 403);
    for (const char *target : {"/ServiceLogin", "/ServiceLogin?continue=https://evil.example/",
                               "/ServiceLogin?continue=//evil.example/o/oauth2/auth%3F",
                               "/ServiceLogin?continue=/o/oauth2/auth%3F%0d%0aX:y",
                               "/o/oauth2/auth", "/o/oauth2/auth?client_id=x&response_type=code"}) {
        visitor->open(target);
        EXPECT_EQ(visitor->status, 400) << target;
    }
    visitor->open(
        "/ServiceLogin?continue=/o/oauth2/auth%3F%22%3E%3Cscript%3E&mail=%22%3E%3Cscript%3E");
    EXPECT_EQ(visitor->page.find("<script>"), std::string::npos);
}

TEST_F(SignIn, anImportGivesAFirstPassword)
{
    const auto user = [](const char *mail, const char *password) {
        return json{{"mail", mail}, {"name", "X"}, {"password", password}};
    };
    ASSERT_TRUE(import({{"users",
                         {user("anna@orvala.example", "another one"),
                          user("cleo@orvala.example", "first one")}}}));
    EXPECT_TRUE(userWithPassword(database(), "anna@orvala.example", "mountains"));
    EXPECT_TRUE(userWithPassword(database(), "cleo@orvala.example", "first one"));
    EXPECT_FALSE(userWithPassword(database(), "cleo@orvala.example", ""));
    EXPECT_FALSE(import({{"users", {user("dan@orvala.example", "short")}}}));
    const std::string token = this->token("cleo@orvala.example");
    setPassword(database(), "cleo@orvala.example", "second one");
    EXPECT_EQ(statusOf("/data/feed/api/user/default?access_token=" + token), 401);
}

TEST(Attempts, areForgottenAfterTheirTime)
{
    SteadyClock::time_point now{};
    Attempts attempts({2, 3, 4, std::chrono::seconds(60)}, [&] { return now; });
    const Attempts::Who anna{"anna", "tv"}, spelled{"ANNA", "phone"}, ben{"ben", "tv"};
    for (int i = 0; i < 3; ++i) {
        EXPECT_EQ(attempts.blockedFor(anna).count(), 0);
        EXPECT_EQ(attempts.needsPanel(anna), i >= 2);
        attempts.noteWrong(anna);
        now += std::chrono::seconds(10);
    }
    EXPECT_EQ(attempts.blockedFor(spelled).count(), 30);
    EXPECT_EQ(attempts.blockedFor(ben).count(), 0);
    EXPECT_TRUE(attempts.needsPanel(ben));
    now += std::chrono::seconds(30);
    EXPECT_EQ(attempts.blockedFor(spelled).count(), 0);
    attempts.noteRight(anna);
    EXPECT_FALSE(attempts.needsPanel(ben));
}

TEST(ShortLived, endsAndKeepsWithinItsBound)
{
    SteadyClock::time_point now{};
    ShortLived<int> values(std::chrono::seconds(10), [&] { return now; });
    const std::string first = values.add(1);
    EXPECT_EQ(values.find(first), 1);
    EXPECT_EQ(values.take(first), 1);
    EXPECT_EQ(values.find(first), std::nullopt);
    const std::string second = values.add(2);
    now += std::chrono::seconds(10);
    EXPECT_EQ(values.take(second), std::nullopt);
    const std::string third = values.add(3);
    now += std::chrono::seconds(1);
    for (int i = 0; i < 1000; ++i)
        values.add(i);
    EXPECT_EQ(values.find(third), std::nullopt);
}
