#pragma once

#include "childprocess.h"

#include <set>
#include <string>
#include <thread>
#include <vector>

// What the service has acknowledged: it has to be there (or gone) after any kill.
struct Acknowledged
{
    std::set<std::string> comments, deletedComments, tags, uploads, users, removedUsers;

    std::size_t count() const
    {
        return comments.size() + deletedComments.size() + tags.size() + uploads.size() +
               users.size() + removedUsers.size();
    }
};

// Threads that write to a running service, each until a request fails.
class Writers
{
public:
    struct Target
    {
        int port;
        std::string album, photo; // paths of their feeds
        std::string token;
        std::string data; // folder
    };

    // `number` makes the texts of this round unlike those of all others.
    Writers(Target target, int number);

    // Ends the commands under way as well; returns when all threads have ended.
    Acknowledged stop();

    // The bytes of the picture that is uploaded under a title.
    static std::string pictureOf(const std::string &title);

private:
    void writeComments();
    void writeTags();
    void upload();
    void manageUsers();
    std::string nextName();
    bool post(const std::string &path, const std::string &body, const char *type,
              std::string *answer = nullptr);

    const Target mTarget;
    const std::string mRound;
    std::atomic<int> mNames{0};
    std::atomic<bool> mIsStopping{false};
    Acknowledged mAcknowledged; // each set belongs to one thread
    ChildProcess mCommand;
    std::vector<std::thread> mThreads;
};
