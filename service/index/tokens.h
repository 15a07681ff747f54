#pragma once

#include "index/records.h"

class Database;
class Session;

// Tokens: random texts of which only the fingerprint is kept. An access token opens the feeds until
// it expires; a refresh token buys new access tokens until its user is signed out or removed.
struct Tokens
{
    std::string access;
    std::string refresh;
    std::int64_t expiresIn = 0; // seconds
};

Tokens issueTokens(Database &database, std::int64_t userId, std::int64_t seconds);

// An access token for the owner of the refresh token; nothing if it is not known.
std::optional<std::string> refreshAccess(Database &database, const std::string &refreshToken,
                                         std::int64_t seconds);

// Ends all tokens of the user, on whatever screens they are.
void endTokens(Session &writer, std::int64_t userId);
// The same by mail; false if there is no such user.
bool signOut(Database &database, const std::string &mail);

// The user whom the access token stands for; nothing if it is unknown or has expired.
std::optional<UserRecord> userOfToken(Session &session, const std::string &accessToken);
