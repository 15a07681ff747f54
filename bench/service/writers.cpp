#include "writers.h"

#include <httplib.h>
#include <nlohmann/json.hpp>
#include <vips/vips.h>

namespace {

std::string entryOf(const std::string &content, const std::string &kind)
{
    return "<entry>" + content +
           "<category scheme=\"https://schemas.orvala.example/2005#kind\" "
           "term=\"https://schemas.orvala.example/photos/2007#" +
           kind + "\"/></entry>";
}

std::string plainPicture()
{
    VipsImage *image = nullptr;
    void *bytes = nullptr;
    std::size_t size = 0;
    vips_black(&image, 64, 48, "bands", 3, nullptr);
    vips_jpegsave_buffer(image, &bytes, &size, nullptr);
    g_object_unref(image);
    std::string picture(static_cast<char *>(bytes), size);
    g_free(bytes);
    return picture;
}

} // namespace

Writers::Writers(Target target, int number)
    : mTarget(std::move(target))
    , mRound(std::to_string(number))
{
    for (const auto write :
         {&Writers::writeComments, &Writers::writeTags, &Writers::upload, &Writers::manageUsers})
        mThreads.emplace_back([this, write] { (this->*write)(); });
}

Acknowledged Writers::stop()
{
    mIsStopping = true;
    mCommand.kill();
    for (std::thread &thread : mThreads)
        thread.join();
    return mAcknowledged;
}

// Long enough to be written in more than one piece.
std::string Writers::pictureOf(const std::string &title)
{
    static const std::string picture = plainPicture();
    std::string bytes = picture;
    while (bytes.size() < 100'000)
        bytes += title;
    return bytes;
}

std::string Writers::nextName()
{
    return "r" + mRound + "n" + std::to_string(mNames++);
}

bool Writers::post(const std::string &path, const std::string &body, const char *type,
                   std::string *answer)
{
    thread_local std::unique_ptr<httplib::Client> client;
    if (!client) {
        client = std::make_unique<httplib::Client>("127.0.0.1", mTarget.port);
        client->set_keep_alive(true);
        client->set_tcp_nodelay(true);
    }
    const auto result = client->Post(path + "?access_token=" + mTarget.token, body, type);
    if (result && answer)
        *answer = result->body;
    return result && result->status == 201;
}

// Every other one is deleted again.
void Writers::writeComments()
{
    httplib::Client client("127.0.0.1", mTarget.port);
    std::string path = mTarget.photo;
    path.replace(path.find("/feed/"), 6, "/entry/");
    for (std::string answer;; answer.clear()) {
        const std::string name = nextName();
        const std::string body = entryOf("<content>" + name + "</content>", "comment");
        if (!post(mTarget.photo, body, "application/atom+xml", &answer))
            return;
        if (mNames % 2 == 0) {
            mAcknowledged.comments.insert(name);
            continue;
        }
        const auto entry = nlohmann::json::parse(answer)["entry"];
        const auto result =
            client.Delete(path + "/commentid/" + entry["gphoto$id"]["$t"].get<std::string>() +
                          "?access_token=" + mTarget.token);
        if (!result || result->status != 200)
            return;
        mAcknowledged.deletedComments.insert(name);
    }
}

void Writers::writeTags()
{
    for (;;) {
        const std::string name = nextName();
        if (!post(mTarget.photo, entryOf("<title>" + name + "</title>", "tag"),
                  "application/atom+xml"))
            return;
        mAcknowledged.tags.insert(name);
    }
}

void Writers::upload()
{
    for (;;) {
        const std::string name = nextName();
        const std::string body = "--B\nContent-Type: application/atom+xml\n\n" +
                                 entryOf("<title>" + name + "</title>", "photo") +
                                 "\n--B\nContent-Type: image/jpeg\n\n" + pictureOf(name) +
                                 "\n--B--";
        if (!post(mTarget.album, body, "multipart/related; boundary=B"))
            return;
        mAcknowledged.uploads.insert(name);
    }
}

// Every other one is removed again.
void Writers::manageUsers()
{
    while (!mIsStopping) {
        const std::string mail = nextName() + "@orvala.example";
        mCommand.start({"user", "add", mail, "--name", "X", "--data", mTarget.data});
        if (!mCommand.wait())
            return;
        mAcknowledged.users.insert(mail);
        if (mAcknowledged.users.size() % 2 == 0 || mIsStopping)
            continue;
        mCommand.start({"user", "remove", mail, "--data", mTarget.data});
        const bool isRemoved = mCommand.wait();
        mAcknowledged.users.erase(mail); // there or not, when the command was killed
        if (isRemoved)
            mAcknowledged.removedUsers.insert(mail);
    }
}
