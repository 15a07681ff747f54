#include "support/testservice.h"

#include "base/texts.h"
#include "index/passwords.h"
#include "index/users.h"
#include "signin/attempts.h"
#include "signin/shortlived.h"

#include <gtest/gtest.h>

namespace {

const std::string client = "client_id=583920174652-abcdefghijklmnopqrstuvwxyz&redirect_uri="
                           "urn:ietf:wg:oauth:2.0:oob";
const std::string authorise =
    "/o/oauth2/auth?" + client + "&scope=https://127.0.0.1:1/data/&response_type=code";
const std::string anna = "anna@orvala.example";

// What stands between two texts, the first time.
std::string between(const std::string &text, const std::string &start, const std::string &end)
{
    const std::size_t from = text.find(start), begin = from + start.size();
    return from == std::string::npos ? "" : text.substr(begin, text.find(end, begin) - begin);
}

// Somebody at a web view: keeps the cookie and the last page, follows where it is sent.
class Visitor
{
public:
    explicit Visitor(const Service &service)
        : mClient("127.0.0.1", service.port())
    {
        open(authorise);
    }

    void open(const std::string &target)
    {
        take(mClient.Get(target, {{"Cookie", cookie}}), target);
    }
    void submit(const std::string &action, const std::string &fields)
    {
        std::string body = fields + "&" + client + "&continue=" + percentEncoded(authorise);
        for (const std::string name : {"form", "challenge"})
            body += "&" + name + "=" + between(page, "name=\"" + name + "\" value=\"", "\"");
        take(mClient.Post(action, {{"Cookie", cookie}}, body, "application/x-www-form-urlencoded"),
             action);
    }
    void signIn(const std::string &mail, const std::string &password)
    {
        submit("/ServiceLogin", "mail=" + mail + "&password=" + password);
    }
    bool shows(const std::string &text) const { return page.find(text) != std::string::npos; }
    bool hasPanel() const { return shows("id=\"logincaptcha\""); }
    std::string title() const { return between(page, "<title>", "</title>"); }

    std::string page, path, cookie;
    int status = 0;

private:
    void take(const httplib::Result &answer, const std::string &target)
    {
        ASSERT_TRUE(answer);
        status = answer->status;
        path = target;
        page = answer->body;
        const std::string set = answer->get_header_value("Set-Cookie");
        if (!set.empty())
            cookie = set.substr(0, set.find(';'));
        // The HTTP library hands out header lines decoded.
        if (status == 302)
            open("/ServiceLogin?continue=" + percentEncoded(authorise));
        else if (status == 303)
            open(answer->get_header_value("Location"));
    }

    httplib::Client mClient;
};

class SignIn : public testing::Test, protected TestService
{
protected:
    void SetUp() override
    {
        start();
        setPassword(database(), anna, "mountains & hills");
    }
    httplib::Result exchange(const std::string &code, const std::string &known = client)
    {
        return post("/o/oauth2/token",
                    "code=" + code + "&client_secret=Qm7rT2vXk9LpZ4wHs1NdYb8E&" + known +
                        "&grant_type=authorization_code",
                    "");
    }
};

} // namespace

TEST_F(SignIn, codesAreBoundToWhatWasAllowed)
{
    Visitor visitor(service());
    const auto code = [&] {
        visitor.open(authorise); // whoever was signed in before is so no more
        EXPECT_EQ(visitor.path.rfind("/ServiceLogin", 0), 0u);
        visitor.signIn("Anna@orvala.example", "mountains+%26+hills");
        visitor.submit("/o/oauth2/approve", "answer=allow");
        return visitor.title().substr(std::string("Success code=").size());
    };
    const std::string used = code();
    EXPECT_EQ(json::parse(exchange(used)->body)["expires_in"], 90 * 24 * 3600);
    EXPECT_EQ(json::parse(exchange(used)->body)["error"], "invalid_grant"); // once only
    const std::string tried = code();
    EXPECT_EQ(exchange(tried, client + ":elsewhere")->status, 400);
    EXPECT_EQ(exchange(tried)->status, 400); // whoever tried has spent it
    EXPECT_EQ(exchange("")->status, 400);
    const std::string last = code();
    removeUser(database(), anna);
    EXPECT_EQ(exchange(last)->status, 400);
}

TEST_F(SignIn, wrongTriesBringThePanelAndThenAPause)
{
    Visitor visitor(service());
    for (int i = 0; i < 3; ++i) {
        EXPECT_FALSE(visitor.hasPanel());
        visitor.signIn(anna, "wrong");
    }
    EXPECT_TRUE(visitor.hasPanel());
    Visitor fresh(service()); // without the cookie it is the same device
    fresh.signIn(anna, "mountains+%26+hills");
    EXPECT_TRUE(fresh.shows("type the digits"));
    for (int i = 0; i < 7; ++i)
        fresh.submit("/ServiceLogin", "mail=" + anna + "&password=mountains+%26+hills&digits=x");
    fresh.signIn(anna, "mountains+%26+hills");
    EXPECT_EQ(fresh.status, 429);
    EXPECT_TRUE(fresh.shows("Please wait 10 minutes."));
}

TEST_F(SignIn, foreignFormsAndOddAddressesAreRefused)
{
    Visitor visitor(service());
    visitor.cookie = "a=b; orvala_visit=planted";
    visitor.signIn(anna, "mountains+%26+hills");
    EXPECT_TRUE(visitor.shows("too old"));
    visitor.cookie = "";
    visitor.submit("/o/oauth2/approve", "answer=allow");
    EXPECT_EQ(visitor.status, 403);
    for (const char *target : {"/ServiceLogin", "/ServiceLogin?continue=https://evil.example/",
                               "/ServiceLogin?continue=//evil.example/o/oauth2/auth%3F",
                               "/ServiceLogin?continue=/o/oauth2/auth%3F%0d%0aX:y",
                               "/o/oauth2/auth", "/o/oauth2/auth?client_id=x&response_type=code"}) {
        visitor.open(target);
        EXPECT_EQ(visitor.status, 400) << target;
    }
    visitor.open(
        "/ServiceLogin?continue=/o/oauth2/auth%3F%22%3E%3Cscript%3E&mail=%22%3E%3Cscript%3E");
    EXPECT_FALSE(visitor.shows("<script>"));
}

TEST_F(SignIn, anImportGivesAFirstPassword)
{
    const auto imports = [&](const std::string &mail, const std::string &password) {
        return import({{"users", {{{"mail", mail}, {"name", "X"}, {"password", password}}}}});
    };
    EXPECT_TRUE(imports(anna, "another one"));
    EXPECT_TRUE(imports("cleo@orvala.example", "first one"));
    EXPECT_TRUE(userWithPassword(database(), anna, "mountains & hills"));
    EXPECT_TRUE(userWithPassword(database(), "cleo@orvala.example", "first one"));
    EXPECT_FALSE(userWithPassword(database(), "cleo@orvala.example", ""));
    EXPECT_FALSE(imports("dan@orvala.example", "short"));
    EXPECT_FALSE(imports("7", "long enough"));
}

TEST(Attempts, areForgottenAfterTheirTime)
{
    SteadyClock::time_point now{};
    Attempts attempts({2, 3, 4, std::chrono::seconds(60)}, [&] { return now; });
    const Attempts::Who who{"anna", "tv"}, spelled{"ANNA", "phone"}, other{"ben", "tv"};
    for (int i = 0; i < 3; ++i) {
        EXPECT_EQ(attempts.needsPanel(who), i >= 2);
        attempts.noteWrong(who);
        now += std::chrono::seconds(10);
    }
    EXPECT_EQ(attempts.blockedFor(spelled).count(), 30);
    EXPECT_EQ(attempts.blockedFor(other).count(), 0);
    now += std::chrono::seconds(30);
    EXPECT_EQ(attempts.blockedFor(spelled).count(), 0);
    EXPECT_TRUE(attempts.needsPanel(other));
    attempts.noteRight(who);
    EXPECT_FALSE(attempts.needsPanel(other));
}

TEST(ShortLived, endsAndKeepsWithinItsBound)
{
    SteadyClock::time_point now{};
    ShortLived<int> values(std::chrono::seconds(10), [&] { return now; });
    const std::string once = values.add(1), old = values.add(2);
    EXPECT_EQ(values.take(once), 1);
    EXPECT_EQ(values.find(once), std::nullopt);
    now += std::chrono::seconds(10);
    EXPECT_EQ(values.take(old), std::nullopt);
    const std::string pushedOut = values.add(3);
    now += std::chrono::seconds(1);
    for (int i = 0; i < 1000; ++i)
        values.add(i);
    EXPECT_EQ(values.find(pushedOut), std::nullopt);
}
