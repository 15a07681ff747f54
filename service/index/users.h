#pragma once

#include "index/records.h"

#include <vector>

class Database;
class Session;

// The people of the house, each with a folder of photos.
std::vector<UserRecord> allUsers(Session &session);
std::optional<UserRecord> userWithId(Session &session, std::int64_t id);
std::optional<UserRecord> userWithMail(Session &session, const std::string &mail);

// Why a text cannot be a user's mail address; empty when it can. Users go by it in addresses.
std::string mailProblem(const std::string &mail);

// Adds the user or changes name and folder of the one with this mail; an empty folder leaves the
// folder as it was. The result is the user's id.
std::int64_t saveUser(Session &writer, const UserRecord &user);
std::int64_t saveUser(Database &database, const UserRecord &user);
// With photos, comments and tokens; false if there was no such user. No file is touched.
bool removeUser(Database &database, const std::string &mail);

// Whether a walk through the user's whole folder has ended; a new folder starts anew.
bool isScanned(Session &session, std::int64_t userId);
void noteScanned(Database &database, std::int64_t userId);

// Changes whenever a user comes, goes or is changed, by any process.
std::int64_t usersRevision(Session &session);
