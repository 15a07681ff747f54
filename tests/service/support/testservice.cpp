#include "support/testservice.h"

#include "index/imports.h"
#include "index/tokens.h"
#include "index/users.h"

#include <gtest/gtest.h>
#include <spdlog/spdlog.h>

namespace {

const char anna[] = "anna@orvala.example";

} // namespace

TestService::TestService()
{
    spdlog::set_level(spdlog::level::off);
    std::filesystem::create_directories(file("photos"));
    std::string error;
    const auto database = openIndex(file("data"), &error);
    EXPECT_EQ(error, "");
    saveUser(*database, {0, anna, "Anna", file("photos")});
    mToken = issueTokens(*database, 1, 3600).access;
}

void TestService::start(bool withTls)
{
    ServiceSettings settings;
    settings.data = file("data");
    settings.withTls = withTls;
    settings.gathered = gathered;
    settings.today = [this] { return today; };
    std::string error;
    mService = Service::start(settings, &error);
    ASSERT_TRUE(mService) << error;
}

void TestService::addPhoto(const std::string &name,
                           const std::map<std::string, std::string> &metadata)
{
    const std::string path = photo(name);
    std::filesystem::create_directories(std::filesystem::path(path).parent_path());
    writePicture(path, 48, 32);
    for (const auto &[key, value] : metadata)
        addMetadata(path, key, value);
}

std::int64_t TestService::addUser(const std::string &mail, const std::string &name,
                                  const std::string &folder)
{
    std::filesystem::create_directories(file(folder));
    return saveUser(database(), {0, mail, name, file(folder)});
}

std::string TestService::token(const std::string &mail, std::int64_t seconds)
{
    std::int64_t id = 0;
    {
        auto reader = database().read();
        id = userWithMail(reader, mail)->id;
    }
    return issueTokens(database(), id, seconds).access;
}

bool TestService::import(const json &document)
{
    ImportResult result;
    std::string error;
    return importDocument(database(), document, &result, &error);
}

httplib::Result TestService::get(const std::string &path, const httplib::Headers &headers)
{
    httplib::Client client("127.0.0.1", mService->port());
    return client.Get(path, headers);
}

json TestService::feed(const std::string &path)
{
    const char mark = path.find('?') == std::string::npos ? '?' : '&';
    return publicFeed(path + mark + "access_token=" + mToken + "&alt=json");
}

json TestService::publicFeed(const std::string &path)
{
    const auto answer = get(path);
    if (!answer || answer->status != 200)
        return nullptr;
    return json::parse(answer->body, nullptr, false)["feed"];
}

int TestService::statusOf(const std::string &path)
{
    const auto answer = get(path);
    return answer ? answer->status : 0;
}

std::string TestService::albumPath(const std::string &title)
{
    const json albums = feed("/data/feed/api/user/default");
    for (const json &entry : albums["entry"]) {
        if (valueOf(entry, "title") == title)
            return pathOf(valueOf(entry, "id"));
    }
    return {};
}

std::vector<std::string> titlesOf(const json &feed)
{
    std::vector<std::string> titles;
    for (const json &entry : feed["entry"])
        titles.push_back(valueOf(entry, "title"));
    return titles;
}

std::string entryOf(const std::string &content, const std::string &kind)
{
    return "<entry xmlns='http://www.w3.org/2005/Atom'>  " + content +
           "  <category scheme=\"https://schemas.orvala.example/2005#kind\"\n"
           "    term=\"https://schemas.orvala.example/photos/2007#" +
           kind + "\"/></entry>";
}

std::string pathOf(const std::string &address)
{
    return address.substr(address.find('/', std::string("https://").size()));
}

std::string valueOf(const json &feed, const std::string &name)
{
    return feed.value(name, json::object()).value("$t", "");
}
