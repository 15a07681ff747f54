#include "support/testservice.h"

#include "index/imports.h"
#include "index/tokens.h"
#include "index/users.h"

#include <gtest/gtest.h>
#include <spdlog/spdlog.h>

#include <thread>

namespace {

const char anna[] = "anna@orvala.example";

} // namespace

TestService::TestService()
{
    spdlog::set_level(spdlog::level::off);
    fs::create_directories(file("photos"));
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
    settings.threads = threads;
    settings.today = [this] { return today; };
    std::string error;
    mService = Service::start(settings, &error);
    ASSERT_TRUE(mService) << error;
    scan();
}

void TestService::addPhoto(const std::string &name,
                           const std::map<std::string, std::string> &metadata)
{
    const std::string path = photo(name);
    fs::create_directories(fs::path(path).parent_path());
    writePicture(path, 48, 32);
    for (const auto &[key, value] : metadata)
        addMetadata(path, key, value);
}

void TestService::addTaken(const std::string &name, const std::string &time,
                           const std::string &caption)
{
    addPhoto(name,
             {{"Exif.Photo.DateTimeOriginal", time}, {"Exif.Image.ImageDescription", caption}});
}

std::int64_t TestService::addUser(const std::string &mail, const std::string &name,
                                  const std::string &folder)
{
    fs::create_directories(file(folder));
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
    return httplib::Client("127.0.0.1", mService->port()).Get(path, headers);
}

httplib::Result TestService::post(const std::string &path, const std::string &body,
                                  const std::string &type)
{
    return httplib::Client("127.0.0.1", mService->port()).Post(path, body, type);
}

httplib::Result TestService::erase(const std::string &path)
{
    return httplib::Client("127.0.0.1", mService->port()).Delete(path);
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

Titles titlesOf(const json &feed)
{
    Titles titles;
    for (const json &entry : feed["entry"])
        titles.push_back(valueOf(entry, "title"));
    return titles;
}

Titles sortedTitlesOf(const json &feed)
{
    Titles titles = titlesOf(feed);
    std::sort(titles.begin(), titles.end());
    return titles;
}

std::string entryOf(const std::string &content, const std::string &kind)
{
    return "<entry xmlns='http://www.w3.org/2005/Atom'>  " + content +
           "  <category scheme=\"https://schemas.orvala.example/2005#kind\"\n"
           "    term=\"https://schemas.orvala.example/photos/2007#" +
           kind + "\"/></entry>";
}

std::string entryPathOf(std::string photo, const std::string &entry)
{
    return photo.replace(photo.find("/feed/"), 6, "/entry/") + entry;
}

std::string pathOf(const std::string &address)
{
    return address.substr(address.find('/', std::string("https://").size()));
}

std::string valueOf(const json &feed, const std::string &name)
{
    return feed.value(name, json::object()).value("$t", "");
}

bool waitFor(const std::function<bool()> &condition)
{
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(30);
    while (!condition() && std::chrono::steady_clock::now() < end)
        std::this_thread::yield();
    return condition();
}
