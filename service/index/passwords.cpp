#include "index/passwords.h"

#include "base/secrets.h"
#include "index/database.h"
#include "index/tokens.h"
#include "index/users.h"

namespace {

constexpr std::size_t shortest = 6; // typed with a remote control, and tries are few
constexpr std::size_t longest = 200;

std::string storedHash(Session &session, const std::string &mail)
{
    Query query(session, "SELECT password FROM users WHERE mail = ?", mail);
    return query.next() ? query.text(0) : std::string();
}

// Of a password that nobody has.
const std::string &nobodysHash()
{
    static const std::string hash = passwordHash(randomText(16));
    return hash;
}

} // namespace

std::string passwordProblem(const std::string &password)
{
    if (password.size() < shortest)
        return "a password has at least " + std::to_string(shortest) + " characters";
    if (password.size() > longest)
        return "a password has at most " + std::to_string(longest) + " bytes";
    return {};
}

bool setPassword(Database &database, const std::string &mail, const std::string &password)
{
    const std::string hash = passwordHash(password);
    Database::Writer writer(database);
    const auto user = userWithMail(writer, mail);
    if (!user)
        return false;
    Query(writer, "UPDATE users SET password = ? WHERE id = ?", hash, user->id).run();
    endTokens(writer, user->id);
    writer.commit();
    return true;
}

bool hasPassword(Database &database, const std::string &mail)
{
    auto reader = database.read();
    return !storedHash(reader, mail).empty();
}

void setFirstPassword(Session &writer, const std::string &mail, const std::string &hash)
{
    Query(writer, "UPDATE users SET password = ? WHERE mail = ? AND password = ''", hash, mail)
        .run();
}

std::optional<UserRecord> userWithPassword(Database &database, const std::string &mail,
                                           const std::string &password)
{
    std::string hash;
    {
        auto reader = database.read();
        hash = storedHash(reader, mail);
    }
    const bool isKnown = !hash.empty() && password.size() <= longest;
    const bool fits = passwordFits(isKnown ? hash : nobodysHash(), password.substr(0, longest));
    if (!isKnown || !fits)
        return std::nullopt;
    auto reader = database.read();
    return userWithMail(reader, mail);
}
