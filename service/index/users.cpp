#include "index/users.h"

#include "index/database.h"
#include "index/revisions.h"

namespace {

UserRecord userAt(const Query &query)
{
    return {query.number(0), query.text(1), query.text(2), query.text(3)};
}

std::optional<UserRecord> firstUser(Query &&query)
{
    if (!query.next())
        return std::nullopt;
    return userAt(query);
}

} // namespace

std::vector<UserRecord> allUsers(Session &session)
{
    std::vector<UserRecord> users;
    Query query(session, "SELECT id, mail, name, photos FROM users ORDER BY id");
    while (query.next())
        users.push_back(userAt(query));
    return users;
}

std::optional<UserRecord> userWithId(Session &session, std::int64_t id)
{
    return firstUser(Query(session, "SELECT id, mail, name, photos FROM users WHERE id = ?", id));
}

std::optional<UserRecord> userWithMail(Session &session, const std::string &mail)
{
    return firstUser(
        Query(session, "SELECT id, mail, name, photos FROM users WHERE mail = ?", mail));
}

std::string mailProblem(const std::string &mail)
{
    const std::size_t at = mail.find('@');
    const bool isMail = at != std::string::npos && at > 0 && at + 1 < mail.size() &&
                        mail.find_first_of(" \t\r\n/?#&") == std::string::npos;
    return isMail ? std::string() : "\"" + mail + "\" is no mail address";
}

std::int64_t saveUser(Session &writer, const UserRecord &user)
{
    Query(writer,
          "INSERT INTO users (mail, name, photos) VALUES (?1, ?2, ?3) "
          "ON CONFLICT (mail) DO UPDATE SET name = ?2, "
          "scanned = CASE WHEN ?3 IN ('', photos) THEN scanned ELSE 0 END, "
          "photos = CASE WHEN ?3 = '' THEN photos ELSE ?3 END",
          user.mail, user.name, user.photos)
        .run();
    raiseRevision(writer, Revision::Users);
    return userWithMail(writer, user.mail)->id;
}

std::int64_t saveUser(Database &database, const UserRecord &user)
{
    Database::Writer writer(database);
    const std::int64_t id = saveUser(static_cast<Session &>(writer), user);
    writer.commit();
    return id;
}

bool removeUser(Database &database, const std::string &mail)
{
    Database::Writer writer(database);
    Query(writer,
          "DELETE FROM photoSearch WHERE rowid IN (SELECT photos.id FROM photos "
          "JOIN albums ON albums.id = photos.album JOIN users ON users.id = albums.user "
          "WHERE users.mail = ?)",
          mail)
        .run();
    const bool found = Query(writer, "DELETE FROM users WHERE mail = ?", mail).run() > 0;
    raiseRevision(writer, Revision::Users);
    raiseRevision(writer, Revision::Photos);
    writer.commit();
    return found;
}

bool isScanned(Session &session, std::int64_t userId)
{
    Query query(session, "SELECT scanned FROM users WHERE id = ?", userId);
    return query.next() && query.number(0) != 0;
}

void noteScanned(Database &database, std::int64_t userId)
{
    Database::Writer writer(database);
    Query(writer, "UPDATE users SET scanned = 1 WHERE id = ?", userId).run();
    writer.commit();
}

std::int64_t usersRevision(Session &session)
{
    return revision(session, Revision::Users);
}
