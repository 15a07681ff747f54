#pragma once

#include "index/records.h"

class Database;
class Session;

// Passwords, of which only the Argon2id hash is kept. Hashing takes long and much memory on
// purpose: one at a time, and never inside a transaction that others wait for.

// Why a text cannot be a password; empty when it can.
std::string passwordProblem(const std::string &password);

// False if there is no such user. Ends all tokens of the user: who knew the old password is out.
bool setPassword(Database &database, const std::string &mail, const std::string &password);

// For who has none yet: the hash goes in with other changes.
bool hasPassword(Database &database, const std::string &mail);
void setFirstPassword(Session &writer, const std::string &mail, const std::string &hash);

// The user, if the password is theirs. Takes as long for a mail address that nobody has.
std::optional<UserRecord> userWithPassword(Database &database, const std::string &mail,
                                           const std::string &password);
