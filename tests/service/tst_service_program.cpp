#include "support/testservice.h"

#include "index/catalogue.h"
#include "pictures/wholefile.h"

#include <gtest/gtest.h>

#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>

#include <array>
#include <csignal>
#include <thread>

namespace fs = std::filesystem;
extern char **environ;

namespace {

using Words = std::vector<std::string>;

// The real program in a process of its own.
class Process
{
public:
    explicit Process(const Words &arguments)
    {
        std::vector<char *> words;
        for (const std::string &argument : arguments)
            words.push_back(const_cast<char *>(argument.c_str()));
        words.push_back(nullptr);
        posix_spawn(&mId, SERVICE_PROGRAM, nullptr, nullptr, words.data(), environ);
    }
    ~Process()
    {
        if (mId > 0)
            end(SIGKILL);
    }
    // How large its files may grow from now on.
    void limitFiles(rlim_t bytes)
    {
        const rlimit limit{bytes, RLIM_INFINITY};
        ::prlimit(mId, RLIMIT_FSIZE, &limit, nullptr);
    }
    // The wait status.
    int end(int signal)
    {
        ::kill(mId, signal);
        int status = 0;
        ::waitpid(mId, &status, 0);
        mId = 0;
        return status;
    }

private:
    pid_t mId = 0;
};

struct Output
{
    int status;
    std::string text;
};

Output run(const std::string &arguments)
{
    std::FILE *pipe = ::popen((SERVICE_PROGRAM " " + arguments + " 2>&1").c_str(), "r");
    Output output;
    std::array<char, 4096> bytes;
    for (std::size_t n; (n = std::fread(bytes.data(), 1, bytes.size(), pipe)) > 0;)
        output.text.append(bytes.data(), n);
    output.status = WEXITSTATUS(::pclose(pipe));
    return output;
}

class Program : public testing::Test
{
protected:
    void SetUp() override { fs::create_directories(mFolder.file("photos/a")); }

    std::string data() const { return mFolder.file("data"); }
    std::unique_ptr<Process> serve()
    {
        const std::string ready = mFolder.file("ready");
        fs::remove(ready);
        auto process =
            std::make_unique<Process>(Words{"orvala-service", "serve", "--http", "--data", data(),
                                            "--photos", mFolder.file("photos"), "--ready-file",
                                            ready, "--log-level", "off", "--gathered", "none"});
        waitFor([&] { return fs::exists(ready); });
        mPort = fs::exists(ready) ? std::stoi(readWholeFile(ready)) : 0;
        return process;
    }
    std::string total()
    {
        httplib::Client client("127.0.0.1", mPort);
        const auto answer = client.Get("/data/feed/api/featured");
        if (!answer || answer->status != 200)
            return "no answer";
        return valueOf(json::parse(answer->body)["feed"], "openSearch$totalResults");
    }
    static bool waitFor(const std::function<bool()> &condition)
    {
        const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(30);
        while (!condition()) {
            if (std::chrono::steady_clock::now() > end)
                return false;
            std::this_thread::yield();
        }
        return true;
    }

    TemporaryFolder mFolder;
    int mPort = 0;
};

} // namespace

TEST_F(Program, doesNotWaitForLargePhotosAtTheEnd)
{
    writePicture(mFolder.file("photos/a/large.png"), 6000, 4000);
    const auto process = serve();
    ASSERT_TRUE(waitFor([&] { return total() == "1"; }));
    httplib::Client client("127.0.0.1", mPort);
    const json feed = json::parse(client.Get("/data/feed/api/featured")->body)["feed"];
    const std::string address = pathOf(feed["entry"][0]["content"]["src"]);
    std::vector<std::thread> threads;
    std::atomic<int> asked{0};
    for (int width = 300; width < 320; ++width) {
        threads.emplace_back([&, width] {
            httplib::Client other("127.0.0.1", mPort);
            std::string sized = address;
            sized.insert(sized.rfind('/'), "/s" + std::to_string(width));
            ++asked;
            other.Get(sized);
        });
    }
    waitFor([&] { return asked == 20; });
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(process->end(SIGTERM), 0);
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(1));
    for (std::thread &thread : threads)
        thread.join();
}

TEST_F(Program, aFullDiskIsSaidAndHarmsNothing)
{
    writePicture(mFolder.file("photos/a/one.jpg"), 16, 16);
    const auto process = serve();
    ASSERT_TRUE(waitFor([&] { return total() == "1"; }));
    const json tokens = json::parse(run("user token family@orvala.example --data " + data()).text);
    const std::string token = "?access_token=" + tokens["access_token"].get<std::string>();
    httplib::Client client("127.0.0.1", mPort);
    const auto feed = [&](const std::string &path) {
        return json::parse(client.Get(path)->body)["feed"]["entry"];
    };
    const std::string album = pathOf(valueOf(feed("/data/feed/api/user/default" + token)[0], "id"));
    const std::string photo = pathOf(valueOf(feed(album + token)[0], "id"));
    const auto comment = [&] {
        return client
            .Post(photo + token,
                  entryOf("<content>" + std::string(9000, 'x') + "</content>", "comment"),
                  "application/atom+xml")
            ->status;
    };
    const std::string picture = readWholeFile(mFolder.file("photos/a/one.jpg"));
    const auto upload = [&] {
        const std::string body = "--B\nContent-Type: application/atom+xml\n\n" +
                                 entryOf("", "photo") + "\n--B\nContent-Type: image/jpeg\n\n" +
                                 picture + std::string(500'000, 'x') + "\n--B--";
        return client.Post(album + token, body, "multipart/related; boundary=B")->status;
    };
    process->limitFiles(400'000);
    std::size_t stored = 0;
    int status = 201;
    for (; stored < 1000 && (status = comment()) == 201; ++stored)
        continue;
    EXPECT_EQ(status, 507);
    EXPECT_EQ(upload(), 507);
    EXPECT_EQ(feed(photo + token + "&kind=comment").size(), stored);
    EXPECT_EQ(contentsOf(mFolder.file("photos/a")).files, 1);
    process->limitFiles(RLIM_INFINITY);
    EXPECT_EQ(comment(), 201);
    EXPECT_EQ(upload(), 201);
    EXPECT_EQ(process->end(SIGTERM), 0);
}

TEST_F(Program, survivesBeingKilledAtAnyMoment)
{
    writePicture(mFolder.file("plain.jpg"), 16, 16);
    for (int i = 0; i < 1500; ++i)
        fs::copy_file(mFolder.file("plain.jpg"),
                      mFolder.file("photos/a/" + std::to_string(i) + ".jpg"));
    for (int round = 0; round < 12; ++round) {
        auto process = serve();
        const auto moment =
            std::chrono::steady_clock::now() + std::chrono::milliseconds(round * 13);
        waitFor([&] { return std::chrono::steady_clock::now() > moment; });
        process->end(SIGKILL);
        SQLite::Database index(data() + "/index.db", SQLite::OPEN_READWRITE);
        EXPECT_EQ(index.execAndGet("PRAGMA integrity_check").getString(), "ok");
        // Counts and search texts go with the photos they belong to.
        EXPECT_EQ(index.execAndGet("SELECT count(*) FROM photos").getInt(),
                  index.execAndGet("SELECT coalesce(sum(photoCount), 0) FROM albums").getInt());
        EXPECT_EQ(index.execAndGet("SELECT count(*) FROM photos").getInt(),
                  index.execAndGet("SELECT count(*) FROM photoSearch").getInt());
    }
    const auto process = serve();
    EXPECT_TRUE(waitFor([&] { return total() == "1500"; }));
}

TEST_F(Program, aRestartReadsNoPhotoAgain)
{
    writePicture(mFolder.file("photos/a/one.jpg"), 16, 16);
    auto process = serve();
    ASSERT_TRUE(waitFor([&] { return total() == "1"; }));
    process->end(SIGTERM);
    // Same size and time, other bytes: whoever reads it finds no picture.
    const auto time = fs::last_write_time(mFolder.file("photos/a/one.jpg"));
    writeBytes(mFolder.file("photos/a/one.jpg"),
               std::string(fs::file_size(mFolder.file("photos/a/one.jpg")), 'x'));
    fs::last_write_time(mFolder.file("photos/a/one.jpg"), time);
    writePicture(mFolder.file("photos/b.jpg"), 16, 16); // found after it, in the next folder
    process = serve();
    EXPECT_TRUE(waitFor([&] { return total() == "2"; }));
}

TEST_F(Program, commandsWorkBesideTheService)
{
    const auto process = serve();
    const std::string inData = " --data " + data();
    EXPECT_EQ(
        run("user add ben@orvala.example --name Ben --photos " + mFolder.file("photos") + inData)
            .status,
        0);
    const Output list = run("user list" + inData);
    EXPECT_NE(list.text.find("family@orvala.example\tFamily"), std::string::npos);
    EXPECT_NE(list.text.find("2\tben@orvala.example\tBen"), std::string::npos);
    const json tokens = json::parse(run("user token ben@orvala.example" + inData).text);
    EXPECT_EQ(tokens["expires_in"], 90 * 24 * 3600);
    httplib::Client client("127.0.0.1", mPort);
    const std::string path =
        "/data/feed/api/user/default?access_token=" + tokens["access_token"].get<std::string>();
    EXPECT_EQ(client.Get(path)->status, 200);
    writeBytes(mFolder.file("import.json"),
               R"({"tags":[{"photo":"a/x.jpg","author":"ben@orvala.example","tag":"t"}]})");
    EXPECT_NE(run("import " + mFolder.file("import.json") + inData).text.find("1 waiting"),
              std::string::npos);
    writeBytes(mFolder.file("short"), "short\n");
    writeBytes(mFolder.file("long"), "long enough\n");
    const std::string passwd = "user passwd ben@orvala.example" + inData + " < ";
    EXPECT_EQ(run(passwd + mFolder.file("short")).status, 1);
    EXPECT_EQ(client.Get(path)->status, 200);
    EXPECT_EQ(run(passwd + mFolder.file("long")).status, 0);
    EXPECT_EQ(client.Get(path)->status, 401); // the old sign-ins end
    EXPECT_EQ(run("user remove ben@orvala.example" + inData).status, 0);
}

TEST_F(Program, mistakesAreExplained)
{
    writeBytes(mFolder.file("file"), "no folder, no index");
    fs::create_directories(mFolder.file("broken/index.db"));
    for (const std::string &arguments :
         {"--data " + mFolder.file("file/data"), "--data " + mFolder.file("broken"),
          "--listen 192.0.2.1 --data " + data()}) {
        const Output output = run("serve --http " + arguments);
        EXPECT_EQ(output.status, 1) << arguments;
        EXPECT_NE(output.text.find(": "), std::string::npos) << output.text;
    }
    writeBytes(mFolder.file("settings"), "[serve]\nport = 70000\n");
    EXPECT_NE(run("--config " + mFolder.file("settings") + " serve").status, 0);
}
