#pragma once

#include <string>

// The commands beside `serve`; each works beside a running service. The result is the exit code:
// what went wrong is on the error output, or is thrown when it is the index.
struct UserOptions
{
    std::string data;
    std::string mail;
    std::string name;
    std::string photos;
    bool readsPassword = false; // from the first line of the input
};

int runUserAdd(const UserOptions &options);
int runUserList(const std::string &data);
int runUserRemove(const std::string &data, const std::string &mail);
// The new password is the first line of the input.
int runUserPassword(const std::string &data, const std::string &mail);
// Ends the user's sign-ins, on all screens.
int runUserSignOut(const std::string &data, const std::string &mail);
// Prints {"access_token", "refresh_token", "expires_in"}.
int runUserToken(const std::string &data, const std::string &mail);
// Paths in the file start at the folder, when one is given.
int runImport(const std::string &data, const std::string &file, const std::string &folder);
int runUnreadable(const std::string &data);
