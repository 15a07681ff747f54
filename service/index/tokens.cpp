#include "index/tokens.h"

#include "base/secrets.h"
#include "base/texts.h"
#include "index/database.h"
#include "index/users.h"

#include <limits>

namespace {

constexpr int accessKind = 1;
constexpr int refreshKind = 2;
constexpr std::int64_t never = std::numeric_limits<std::int64_t>::max();
constexpr std::size_t tokenBytes = 32;

std::string issue(Session &session, std::int64_t userId, int kind, std::int64_t expires)
{
    std::string token = randomText(tokenBytes);
    Query(session, "INSERT INTO tokens (hash, user, kind, expires) VALUES (?, ?, ?, ?)",
          fingerprint(token), userId, kind, expires)
        .run();
    return token;
}

void forgetExpired(Session &session)
{
    Query(session, "DELETE FROM tokens WHERE expires <= ?", currentSeconds()).run();
}

} // namespace

Tokens issueTokens(Database &database, std::int64_t userId, std::int64_t seconds)
{
    Database::Writer writer(database);
    forgetExpired(writer);
    Tokens tokens;
    tokens.access = issue(writer, userId, accessKind, currentSeconds() + seconds);
    tokens.refresh = issue(writer, userId, refreshKind, never);
    tokens.expiresIn = seconds;
    writer.commit();
    return tokens;
}

std::optional<std::string> refreshAccess(Database &database, const std::string &refreshToken,
                                         std::int64_t seconds)
{
    Database::Writer writer(database);
    std::int64_t userId = 0;
    {
        Query query(writer, "SELECT user FROM tokens WHERE hash = ? AND kind = ?",
                    fingerprint(refreshToken), refreshKind);
        if (!query.next())
            return std::nullopt;
        userId = query.number(0);
    }
    forgetExpired(writer);
    std::string token = issue(writer, userId, accessKind, currentSeconds() + seconds);
    writer.commit();
    return token;
}

void endTokens(Session &writer, std::int64_t userId)
{
    Query(writer, "DELETE FROM tokens WHERE user = ?", userId).run();
}

bool signOut(Database &database, const std::string &mail)
{
    Database::Writer writer(database);
    const auto user = userWithMail(writer, mail);
    if (!user)
        return false;
    endTokens(writer, user->id);
    writer.commit();
    return true;
}

std::optional<UserRecord> userOfToken(Session &session, const std::string &accessToken)
{
    Query query(session,
                "SELECT users.id, mail, name, photos FROM tokens "
                "JOIN users ON users.id = tokens.user WHERE hash = ? AND kind = ? AND expires > ?",
                fingerprint(accessToken), accessKind, currentSeconds());
    if (!query.next())
        return std::nullopt;
    return UserRecord{query.number(0), query.text(1), query.text(2), query.text(3)};
}
