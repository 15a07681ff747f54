#include "support/testservice.h"

#include "pictures/wholefile.h"

#include <gtest/gtest.h>

#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>

#include <csignal>
#include <thread>

extern char **environ;

namespace {

struct Output
{
    int status;
    std::string text;
};

// The real program in a process of its own.
class Program : public testing::Test
{
protected:
    void SetUp() override { fs::create_directories(mFolder.file("photos/a")); }
    void TearDown() override { end(SIGKILL); }

    void serve()
    {
        const std::string ready = mFolder.file("ready");
        fs::remove(ready);
        std::string words[] = {"orvala-service",
                               "serve",
                               "--http",
                               "--data",
                               mData,
                               "--photos",
                               mFolder.file("photos"),
                               "--ready-file",
                               ready,
                               "--log-level",
                               "off",
                               "--gathered",
                               "none"};
        std::vector<char *> arguments;
        for (std::string &word : words)
            arguments.push_back(word.data());
        arguments.push_back(nullptr);
        posix_spawn(&mId, SERVICE_PROGRAM, nullptr, nullptr, arguments.data(), environ);
        ASSERT_TRUE(waitFor([&] { return fs::exists(ready); }));
        mPort = std::stoi(readWholeFile(ready));
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
        int status = 0;
        if (mId > 0 && ::kill(mId, signal) == 0)
            ::waitpid(mId, &status, 0);
        mId = 0;
        return status;
    }
    Output run(const std::string &arguments)
    {
        const std::string output = mFolder.file("output");
        const std::string command = SERVICE_PROGRAM " " + arguments + " >" + output + " 2>&1";
        const int status = std::system(command.c_str());
        return {WEXITSTATUS(status), readWholeFile(output)};
    }
    // Of the command `user`.
    Output user(const std::string &arguments) { return run("user " + arguments + mInData); }
    httplib::Result get(const std::string &path)
    {
        return httplib::Client("127.0.0.1", mPort).Get(path);
    }
    json entries(const std::string &path) { return json::parse(get(path)->body)["feed"]["entry"]; }
    bool hasPhotos(std::size_t count)
    {
        return waitFor(
            [&] { return entries(feedBase + "featured?max-results=1000").size() == count; });
    }
    std::string tokenOf(const std::string &mail)
    {
        const json tokens = json::parse(user("token " + mail).text);
        return "?access_token=" + tokens["access_token"].get<std::string>();
    }

    TemporaryFolder mFolder;
    const std::string mData = mFolder.file("data"), mInData = " --data " + mData;
    const std::string mPhoto = mFolder.file("photos/a/one.jpg");
    int mPort = 0;
    pid_t mId = 0;
};

} // namespace

TEST_F(Program, doesNotWaitForLargePhotosAtTheEnd)
{
    writePicture(mFolder.file("photos/a/large.png"), 6000, 4000);
    serve();
    ASSERT_TRUE(hasPhotos(1));
    const std::string address = pathOf(entries(feedBase + "featured")[0]["content"]["src"]);
    std::vector<std::thread> threads;
    std::atomic<int> asked{0};
    for (int width = 300; width < 320; ++width) {
        threads.emplace_back([&, sized = address, width]() mutable {
            sized.insert(sized.rfind('/'), "/s" + std::to_string(width));
            ++asked;
            get(sized);
        });
    }
    waitFor([&] { return asked == 20; });
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(end(SIGTERM), 0);
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(1));
    for (std::thread &thread : threads)
        thread.join();
}

TEST_F(Program, aFullDiskIsSaidAndHarmsNothing)
{
    writePicture(mPhoto, 16, 16);
    serve();
    ASSERT_TRUE(hasPhotos(1));
    const std::string token = tokenOf("family@orvala.example");
    const std::string album = pathOf(valueOf(entries(feedBase + "user/default" + token)[0], "id"));
    const std::string photo = pathOf(valueOf(entries(album + token)[0], "id"));
    httplib::Client client("127.0.0.1", mPort);
    const auto comment = [&] {
        const std::string text = "<content>" + std::string(9000, 'x') + "</content>";
        return client.Post(photo + token, entryOf(text, "comment"), "application/atom+xml")->status;
    };
    const auto upload = [&] {
        const std::string body = "--B\nContent-Type: application/atom+xml\n\n" +
                                 entryOf("", "photo") + "\n--B\nContent-Type: image/jpeg\n\n" +
                                 readWholeFile(mPhoto) + std::string(500'000, 'x') + "\n--B--";
        return client.Post(album + token, body, "multipart/related; boundary=B")->status;
    };
    limitFiles(400'000);
    std::size_t stored = 0;
    int status = 201;
    for (; stored < 1000 && (status = comment()) == 201; ++stored)
        continue;
    EXPECT_EQ(status, 507);
    EXPECT_EQ(upload(), 507);
    EXPECT_EQ(entries(photo + token + "&kind=comment").size(), stored);
    EXPECT_EQ(contentsOf(mFolder.file("photos/a")).files, 1);
    limitFiles(RLIM_INFINITY);
    EXPECT_EQ(comment(), 201);
    EXPECT_EQ(upload(), 201);
}

TEST_F(Program, commandsWorkBesideTheService)
{
    serve();
    const std::string ben = " ben@orvala.example";
    EXPECT_EQ(user("add" + ben + " --name Ben --photos " + mFolder.file("photos")).status, 0);
    const std::string list = user("list").text;
    EXPECT_NE(list.find("family@orvala.example\tFamily"), std::string::npos);
    EXPECT_NE(list.find("2\tben@orvala.example\tBen"), std::string::npos);
    writeBytes(mFolder.file("import"),
               R"({"tags":[{"photo":"a/x.jpg","author":"ben@orvala.example","tag":"t"}]})");
    EXPECT_NE(run("import " + mFolder.file("import") + mInData).text.find("1 waiting"),
              std::string::npos);
    const std::string path = feedBase + "user/default" + tokenOf(ben);
    EXPECT_EQ(user("passwd" + ben + " </dev/null").status, 1);
    EXPECT_EQ(user("sign-out nobody@orvala.example").status, 1);
    EXPECT_EQ(get(path)->status, 200);
    EXPECT_EQ(user("sign-out" + ben).status, 0);
    EXPECT_EQ(get(path)->status, 401);
    const std::string other = feedBase + "user/default" + tokenOf(ben);
    writeBytes(mFolder.file("password"), "long enough\n");
    EXPECT_EQ(user("passwd" + ben + " <" + mFolder.file("password")).status, 0);
    EXPECT_EQ(get(other)->status, 401);
    EXPECT_EQ(user("remove" + ben).status, 0);
}

TEST_F(Program, mistakesAreExplained)
{
    writeBytes(mFolder.file("file"), "no folder, no index");
    fs::create_directories(mFolder.file("broken/index.db"));
    writeBytes(mFolder.file("range"), "[serve]\nport = 70000\n");
    writeBytes(mFolder.file("typing"), "[serve]\nprot = 7000\n");
    for (const std::string &arguments :
         {"serve --http --data " + mFolder.file("file/data"),
          "serve --http --data " + mFolder.file("broken"),
          "serve --http --listen 192.0.2.1" + mInData,
          "--config " + mFolder.file("range") + " serve" + mInData,
          "--config " + mFolder.file("typing") + " serve" + mInData}) {
        const Output output = run(arguments);
        EXPECT_NE(output.status, 0) << arguments;
        EXPECT_NE(output.text.find(' '), std::string::npos) << output.text;
    }
}
