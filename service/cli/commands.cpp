#include "cli/commands.h"

#include "base/texts.h"
#include "index/catalogue.h"
#include "index/database.h"
#include "index/imports.h"
#include "index/passwords.h"
#include "index/tokens.h"
#include "index/users.h"
#include "service.h"

#include <nlohmann/json.hpp>

#include <termios.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <functional>
#include <iostream>

using nlohmann::json;

namespace {

constexpr std::int64_t tokenSeconds = 90 * 24 * 3600;

int fail(const std::string &message)
{
    std::cerr << "orvala-service: " << message << "\n";
    return 1;
}

// Opens the index for one piece of work.
int withIndex(const std::string &data, const std::function<int(Database &)> &work)
{
    std::string error;
    const auto database = openIndex(data, &error);
    if (!database)
        return fail(error);
    return work(*database);
}

bool isFolder(const std::string &path)
{
    std::error_code code;
    return std::filesystem::is_directory(path, code);
}

// The first line of the input; what is typed at a terminal stays invisible.
std::string readPassword()
{
    termios state{};
    const bool isTerminal = ::tcgetattr(STDIN_FILENO, &state) == 0;
    if (isTerminal) {
        std::cerr << "Password: " << std::flush;
        termios silent = state;
        silent.c_lflag &= ~tcflag_t(ECHO);
        ::tcsetattr(STDIN_FILENO, TCSAFLUSH, &silent);
    }
    std::string line;
    std::getline(std::cin, line);
    if (isTerminal) {
        ::tcsetattr(STDIN_FILENO, TCSAFLUSH, &state);
        std::cerr << "\n";
    }
    return line;
}

} // namespace

int runUserAdd(const UserOptions &options)
{
    if (const std::string problem = mailProblem(options.mail); !problem.empty())
        return fail(problem);
    if (!options.photos.empty() && !isFolder(options.photos))
        return fail("there is no folder " + options.photos);
    const std::string password = options.readsPassword ? readPassword() : "";
    const std::string problem = options.readsPassword ? passwordProblem(password) : "";
    if (!problem.empty())
        return fail(problem);
    return withIndex(options.data, [&](Database &database) {
        const std::string photos = options.photos.empty() ? "" : absoluteFolder(options.photos);
        saveUser(database, {0, options.mail, options.name, photos});
        if (options.readsPassword)
            setPassword(database, options.mail, password);
        return 0;
    });
}

int runUserList(const std::string &data)
{
    return withIndex(data, [](Database &database) {
        auto reader = database.read();
        for (const UserRecord &user : allUsers(reader))
            std::cout << user.id << "\t" << user.mail << "\t" << user.name << "\t" << user.photos
                      << "\n";
        return 0;
    });
}

int runUserRemove(const std::string &data, const std::string &mail)
{
    return withIndex(data, [&](Database &database) {
        return removeUser(database, mail) ? 0 : fail("there is no user " + mail);
    });
}

int runUserPassword(const std::string &data, const std::string &mail)
{
    const std::string password = readPassword();
    const std::string problem = passwordProblem(password);
    if (!problem.empty())
        return fail(problem);
    return withIndex(data, [&](Database &database) {
        return setPassword(database, mail, password) ? 0 : fail("there is no user " + mail);
    });
}

int runUserSignOut(const std::string &data, const std::string &mail)
{
    return withIndex(data, [&](Database &database) {
        return signOut(database, mail) ? 0 : fail("there is no user " + mail);
    });
}

int runUserToken(const std::string &data, const std::string &mail)
{
    return withIndex(data, [&](Database &database) {
        std::optional<UserRecord> user;
        {
            auto reader = database.read();
            user = userWithMail(reader, mail);
        }
        if (!user)
            return fail("there is no user " + mail);
        const Tokens tokens = issueTokens(database, user->id, tokenSeconds);
        std::cout << json({{"access_token", tokens.access},
                           {"refresh_token", tokens.refresh},
                           {"expires_in", tokens.expiresIn}})
                         .dump()
                  << "\n";
        return 0;
    });
}

int runImport(const std::string &data, const std::string &file, const std::string &folder)
{
    std::ifstream stream(file);
    if (!stream)
        return fail("cannot read " + file);
    json document = json::parse(stream, nullptr, false);
    if (document.is_discarded())
        return fail(file + " is no JSON");
    if (!folder.empty())
        resolvePaths(document, folder);
    return withIndex(data, [&](Database &database) {
        ImportResult result;
        std::string error;
        if (!importDocument(database, document, &result, &error))
            return fail(error);
        std::cout << result.users << " users, " << result.comments << " new comments, "
                  << result.tags << " new tags, " << result.waiting
                  << " waiting for photos not yet found\n";
        return 0;
    });
}

int runUnreadable(const std::string &data)
{
    return withIndex(data, [](Database &database) {
        auto reader = database.read();
        for (const UnreadablePhoto &photo : unreadablePhotos(reader))
            std::cout << photo.path << "\t" << photo.error << "\n";
        return 0;
    });
}
