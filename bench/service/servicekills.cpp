#include "base/texts.h"
#include "index/database.h"
#include "index/tokens.h"
#include "index/users.h"
#include "pictures/wholefile.h"
#include "service.h"
#include "support/bench.h"
#include "writers.h"

#include <httplib.h>
#include <nlohmann/json.hpp>

#include <filesystem>
#include <map>
#include <random>

// servicekills [rounds [program]]: kills the service at random moments while comments, tags,
// uploads and users are written, and looks after each start whether everything acknowledged is
// there and nothing half written is served. Every twentieth round starts with an empty data folder;
// every third kill falls into the start.
namespace {

namespace fs = std::filesystem;
using nlohmann::json;
using Texts = std::set<std::string>;

const char anna[] = "anna@orvala.example";
constexpr int roundsOfAFolder = 20;
constexpr int manyPhotos = 400;
constexpr std::chrono::seconds patience{20};

int missingOf(const Texts &expected, const Texts &found)
{
    return static_cast<int>(std::count_if(expected.begin(), expected.end(),
                                          [&](const auto &text) { return !found.count(text); }));
}

int foundOf(const Texts &gone, const Texts &found)
{
    return static_cast<int>(gone.size()) - missingOf(gone, found);
}

class KillRounds
{
public:
    explicit KillRounds(fs::path folder)
        : mFolder(std::move(folder))
    {
    }

    std::size_t acknowledged = 0;
    int lost = 0, halfWritten = 0, damaged = 0, notStarted = 0, leftBehind = 0;

    void run(int rounds)
    {
        for (int round = 0; round < rounds; ++round) {
            if (round % roundsOfAFolder == 0)
                startAfresh();
            if (round % 3 == 2)
                killWhileItStarts();
            writeUntilKilled(round);
        }
    }

private:
    std::string path(const std::string &name) const { return mFolder / name; }

    void startAfresh()
    {
        fs::remove_all(mFolder);
        fs::create_directories(path("photos/Sea"));
        std::ofstream(path("photos/Sea/first.jpg")) << Writers::pictureOf("first");
        fs::create_directories(path("photos/Many")); // so that kills fall into the first scan
        for (int i = 0; i < manyPhotos; ++i)
            fs::create_hard_link(path("photos/Sea/first.jpg"),
                                 path("photos/Many/" + std::to_string(i) + ".jpg"));
        mExpected = {};
        mChecked.clear();
        std::string error;
        const auto index = openIndex(path("data"), &error);
        mToken =
            issueTokens(*index, saveUser(*index, {0, anna, "Anna", path("photos")}), 86'400).access;
    }

    void launch(ChildProcess &service)
    {
        fs::remove(path("ready"));
        service.start({"serve", "--http", "--data", path("data"), "--ready-file", path("ready"),
                       "--log-level", "off", "--gathered", "none"});
    }
    void sleepUpTo(int milliseconds)
    {
        std::uniform_int_distribution<int> any(0, milliseconds * 1000);
        std::this_thread::sleep_for(std::chrono::microseconds(any(mRandom)));
    }
    void killWhileItStarts()
    {
        ChildProcess service;
        launch(service);
        sleepUpTo(40);
    }

    void writeUntilKilled(int round)
    {
        ChildProcess service;
        launch(service);
        if (!find()) {
            ++notStarted;
            return;
        }
        check();
        Writers writers({mPort, mAlbum, mPhoto, mToken, path("data")}, round);
        sleepUpTo(120);
        service.kill();
        note(writers.stop());
        service.wait();
        checkFiles();
    }

    // Waits for the service and for the first photo.
    bool find()
    {
        const auto end = std::chrono::steady_clock::now() + patience;
        while (std::chrono::steady_clock::now() < end) {
            std::this_thread::sleep_for(std::chrono::milliseconds(2));
            if (!fs::exists(path("ready")))
                continue;
            mPort = std::stoi(readWholeFile(path("ready")));
            const json albums = entries("/data/feed/api/user/default");
            mAlbum.clear();
            for (const json &entry : albums) {
                if (entry["title"]["$t"] == "Sea")
                    mAlbum = pathOf(entry["id"]["$t"]);
            }
            const json photos = mAlbum.empty() ? json() : entries(mAlbum);
            mPhoto.clear();
            for (const json &entry : photos) {
                if (entry["title"]["$t"] == "first")
                    mPhoto = pathOf(entry["id"]["$t"]);
            }
            if (!mPhoto.empty())
                return true;
        }
        return false;
    }

    static std::string pathOf(const std::string &address)
    {
        return address.substr(address.find('/', 8));
    }
    std::string get(const std::string &target) const
    {
        const auto answer = httplib::Client("127.0.0.1", mPort).Get(target);
        return answer && answer->status == 200 ? answer->body : "";
    }
    json entries(const std::string &feed) const
    {
        const char mark = feed.find('?') == std::string::npos ? '?' : '&';
        const json document =
            json::parse(get(feed + mark + "access_token=" + mToken), nullptr, false);
        return document.is_object() ? document["feed"].value("entry", json::array()) : json();
    }
    Texts textsOf(const std::string &feed, const char *name) const
    {
        Texts texts;
        for (const json &entry : entries(feed))
            texts.insert(entry[name]["$t"].get<std::string>());
        return texts;
    }

    void note(const Acknowledged &news)
    {
        acknowledged += news.count();
        mExpected.comments.insert(news.comments.begin(), news.comments.end());
        mExpected.deletedComments.insert(news.deletedComments.begin(), news.deletedComments.end());
        mExpected.tags.insert(news.tags.begin(), news.tags.end());
        mExpected.uploads.insert(news.uploads.begin(), news.uploads.end());
        mExpected.users.insert(news.users.begin(), news.users.end());
        mExpected.removedUsers.insert(news.removedUsers.begin(), news.removedUsers.end());
    }

    void check()
    {
        const Texts comments = textsOf(mPhoto + "?kind=comment", "content");
        lost +=
            missingOf(mExpected.comments, comments) + foundOf(mExpected.deletedComments, comments);
        lost += missingOf(mExpected.tags, textsOf(mPhoto + "?kind=tag", "title"));
        Texts titles;
        for (const json &entry : entries(mAlbum)) {
            const std::string title = entry["title"]["$t"];
            titles.insert(title);
            if (mChecked.insert(title).second)
                halfWritten += get(pathOf(entry["content"]["src"])) != Writers::pictureOf(title);
        }
        lost += missingOf(mExpected.uploads, titles);
        const Texts mails = users();
        lost += missingOf(mExpected.users, mails) + foundOf(mExpected.removedUsers, mails);
    }

    Texts users() const
    {
        SQLite::Database index(path("data/index.db"), SQLite::OPEN_READONLY);
        SQLite::Statement query(index, "SELECT mail FROM users");
        Texts mails;
        while (query.executeStep())
            mails.insert(query.getColumn(0).getString());
        return mails;
    }

    void checkFiles()
    {
        SQLite::Database index(path("data/index.db"), SQLite::OPEN_READWRITE);
        damaged += index.execAndGet("PRAGMA integrity_check").getString() != "ok";
        // Counts and search texts go with the photos they belong to.
        const auto count = [&index](const char *query) { return index.execAndGet(query).getInt(); };
        const int photos = count("SELECT count(*) FROM photos");
        damaged += photos != count("SELECT coalesce(sum(photoCount), 0) FROM albums") ||
                   photos != count("SELECT count(*) FROM photoSearch");
        for (const auto &entry : fs::directory_iterator(path("photos/Sea")))
            leftBehind += entry.path().filename().string()[0] == '.';
    }

    const fs::path mFolder;
    std::mt19937 mRandom{7};
    Acknowledged mExpected;
    Texts mChecked; // titles whose pictures have been compared
    std::string mToken, mAlbum, mPhoto;
    int mPort = 0;
};

int run(int argc, char **argv)
{
    const int count = argc > 1 ? std::atoi(argv[1]) : 3000;
    if (argc > 2)
        ChildProcess::program = argv[2];
    char name[] = "servicekills_XXXXXX";
    const fs::path folder = fs::absolute(::mkdtemp(name));
    KillRounds rounds(folder / "round");
    rounds.run(count);
    fs::remove_all(folder);
    std::printf("%d kills of the service, %zu acknowledged writes: %d lost, %d pictures half "
                "written, %d indexes damaged, %d starts failed, %d files left behind\n",
                count + count / 3, rounds.acknowledged, rounds.lost, rounds.halfWritten,
                rounds.damaged, rounds.notStarted, rounds.leftBehind);
    return rounds.lost || rounds.halfWritten || rounds.damaged || rounds.notStarted ? 1 : 0;
}

} // namespace

int main(int argc, char **argv)
{
    try {
        return run(argc, argv);
    } catch (const std::exception &exception) {
        std::printf("broken off: %s\n", exception.what());
        return 1;
    }
}
