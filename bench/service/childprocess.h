#pragma once

#include <spawn.h>
#include <sys/wait.h>

#include <atomic>
#include <csignal>
#include <string>
#include <vector>

extern char **environ;

// The service's program in a process of its own, which may be killed from any thread.
class ChildProcess
{
public:
    static inline std::string program = SERVICE_PROGRAM;

    ~ChildProcess()
    {
        kill();
        wait();
    }
    void start(std::vector<std::string> arguments)
    {
        arguments.insert(arguments.begin(), "orvala-service");
        std::vector<char *> words;
        words.reserve(arguments.size() + 1);
        for (std::string &argument : arguments)
            words.push_back(argument.data());
        words.push_back(nullptr);
        pid_t id = 0;
        if (posix_spawn(&id, program.c_str(), nullptr, nullptr, words.data(), environ) == 0)
            mId = id;
    }
    void kill()
    {
        if (mId > 0)
            ::kill(mId, SIGKILL);
    }
    // True when it ended by itself and with success.
    bool wait()
    {
        int status = -1;
        if (mId > 0)
            ::waitpid(mId, &status, 0);
        mId = 0;
        return WIFEXITED(status) && WEXITSTATUS(status) == 0;
    }

private:
    std::atomic<pid_t> mId{0};
};
