#include "index/imports.h"

#include "base/secrets.h"
#include "base/texts.h"
#include "index/database.h"
#include "index/passwords.h"
#include "index/photosearch.h"
#include "index/users.h"

#include <nlohmann/json.hpp>

#include <filesystem>
#include <map>

using nlohmann::json;

namespace {

const char commentKind[] = "comment";
const char tagKind[] = "tag";

struct Waiting
{
    std::int64_t id;
    std::string kind;
    std::string path;
    std::int64_t author;
    std::string content;
    std::string published;
};

std::string textOf(const json &object, const char *member)
{
    const auto found = object.find(member);
    return found != object.end() && found->is_string() ? found->get<std::string>() : std::string();
}

bool checkList(const json &document, const char *list, const std::vector<const char *> &members,
               std::string *error)
{
    const auto found = document.find(list);
    if (found == document.end())
        return true;
    if (!found->is_array()) {
        *error = std::string("\"") + list + "\" is not a list";
        return false;
    }
    for (std::size_t i = 0; i < found->size(); ++i) {
        for (const char *member : members) {
            const json &entry = (*found)[i];
            if (entry.is_object() && !textOf(entry, member).empty())
                continue;
            *error = std::string(list) + "[" + std::to_string(i) + "] has no \"" + member + "\"";
            return false;
        }
    }
    return true;
}

bool checkAuthors(Session &session, const json &document, const char *list, std::string *error)
{
    for (const json &entry : document.value(list, json::array())) {
        const std::string mail = textOf(entry, "author");
        if (userWithMail(session, mail))
            continue;
        *error = "there is no user " + mail;
        return false;
    }
    return true;
}

// In UTC as the index keeps it; empty without a time.
std::string publishedOf(const json &entry)
{
    const auto seconds = parseTime(textOf(entry, "published"));
    return seconds ? utcTime(*seconds) : std::string();
}

int remember(Session &session, const json &entry, const char *kind, const std::string &content)
{
    const std::int64_t author = userWithMail(session, textOf(entry, "author"))->id;
    return Query(session,
                 "INSERT OR IGNORE INTO imports (kind, path, author, content, published) "
                 "VALUES (?, ?, ?, ?, ?)",
                 std::string(kind), textOf(entry, "photo"), author, content, publishedOf(entry))
        .run();
}

std::vector<Waiting> waitingImports(Session &session)
{
    std::vector<Waiting> list;
    Query query(session, "SELECT id, kind, path, author, content, published FROM imports "
                         "WHERE done = 0 ORDER BY id");
    while (query.next())
        list.push_back({query.number(0), query.text(1), query.text(2), query.number(3),
                        query.text(4), query.text(5)});
    return list;
}

// An absolute path lies in one user's folder; a relative one is the same below every user's: the
// first user's photo it is.
std::int64_t photoAtPath(Session &session, const std::string &path)
{
    const std::size_t slash = path.rfind('/');
    const std::string folder = slash == std::string::npos ? "" : path.substr(0, slash);
    const std::string name = slash == std::string::npos ? path : path.substr(slash + 1);
    Query query(session,
                "SELECT p.id FROM users u JOIN albums a ON a.user = u.id "
                "AND (a.folder = ?1 OR rtrim(u.photos || '/' || a.folder, '/') = ?1) "
                "JOIN photos p ON p.album = a.id AND p.name = ?2 ORDER BY u.id LIMIT 1",
                folder, name);
    return query.next() ? query.number(0) : 0;
}

void apply(Session &session, const Waiting &item, std::int64_t photoId)
{
    const std::string now = utcTime(currentSeconds());
    if (item.kind == commentKind)
        Query(session,
              "INSERT INTO comments (photo, author, content, published) VALUES (?, ?, ?, ?)",
              photoId, item.author, item.content, item.published.empty() ? now : item.published)
            .run();
    for (const std::string &tag : tagsIn(item.kind == tagKind ? item.content : ""))
        Query(session, "INSERT OR IGNORE INTO tags (photo, tag, author) VALUES (?, ?, ?)", photoId,
              tag, item.author)
            .run();
    Query(session, "UPDATE imports SET done = 1 WHERE id = ?", item.id).run();
    refreshPhotoSearch(session, photoId);
}

int applyWaiting(Session &session)
{
    int waiting = 0;
    for (const Waiting &item : waitingImports(session)) {
        const std::int64_t photoId = photoAtPath(session, item.path);
        if (photoId != 0)
            apply(session, item, photoId);
        else
            ++waiting;
    }
    return waiting;
}

std::string problemOf(const json &user)
{
    const std::string mail = textOf(user, "mail");
    const std::string problem =
        user.contains("password") ? passwordProblem(textOf(user, "password")) : "";
    return problem.empty() ? mailProblem(mail) : mail + ": " + problem;
}

bool checkUsers(const json &document, std::string *error)
{
    for (const json &user : document.value("users", json::array())) {
        *error = problemOf(user);
        if (!error->empty())
            return false;
    }
    return true;
}

// By mail, for the users who have no password yet. Hashing takes its time: before the transaction.
std::map<std::string, std::string> firstPasswords(Database &database, const json &document)
{
    std::map<std::string, std::string> hashes;
    for (const json &user : document.value("users", json::array())) {
        const std::string mail = textOf(user, "mail");
        if (user.contains("password") && !hasPassword(database, mail))
            hashes[mail] = passwordHash(textOf(user, "password"));
    }
    return hashes;
}

bool checkTimes(const json &document, std::string *error)
{
    for (const json &entry : document.value("comments", json::array())) {
        const std::string published = textOf(entry, "published");
        if (published.empty() || parseTime(published))
            continue;
        *error = "\"" + published + "\" is no time";
        return false;
    }
    return true;
}

std::string photosOf(const json &user)
{
    const std::string folder = textOf(user, "photos");
    return folder.empty() ? folder : absoluteFolder(folder);
}

bool checkShape(const json &document, std::string *error)
{
    if (!document.is_object()) {
        *error = "the file holds no JSON object";
        return false;
    }
    return checkList(document, "users", {"mail", "name"}, error) &&
           checkList(document, "comments", {"photo", "author", "text"}, error) &&
           checkList(document, "tags", {"photo", "author", "tag"}, error) &&
           checkTimes(document, error) && checkUsers(document, error);
}

void makeAbsolute(json &entry, const char *key, const std::filesystem::path &folder)
{
    if (entry.is_object() && entry.contains(key) && entry[key].is_string())
        entry[key] = (folder / entry[key].get<std::string>()).lexically_normal().string();
}

} // namespace

void resolvePaths(json &document, const std::string &folder)
{
    const auto start = std::filesystem::absolute(folder);
    const auto resolve = [&](const char *list, const char *key) {
        if (document.is_object() && document.contains(list) && document[list].is_array()) {
            for (json &entry : document[list])
                makeAbsolute(entry, key, start);
        }
    };
    resolve("users", "photos");
    resolve("comments", "photo");
    resolve("tags", "photo");
}

bool importDocument(Database &database, const json &document, ImportResult *result,
                    std::string *error)
{
    if (!checkShape(document, error))
        return false;
    const auto hashes = firstPasswords(database, document);
    Database::Writer writer(database);
    for (const json &user : document.value("users", json::array())) {
        saveUser(writer, {0, textOf(user, "mail"), textOf(user, "name"), photosOf(user)});
        ++result->users;
    }
    for (const auto &[mail, hash] : hashes)
        setFirstPassword(writer, mail, hash);
    if (!checkAuthors(writer, document, "comments", error) ||
        !checkAuthors(writer, document, "tags", error))
        return false;
    for (const json &comment : document.value("comments", json::array()))
        result->comments += remember(writer, comment, commentKind, textOf(comment, "text"));
    for (const json &tag : document.value("tags", json::array()))
        result->tags += remember(writer, tag, tagKind, textOf(tag, "tag"));
    result->waiting = applyWaiting(writer);
    writer.commit();
    return true;
}

int applyImports(Database &database)
{
    {
        auto reader = database.read();
        if (waitingImports(reader).empty())
            return 0;
    }
    Database::Writer writer(database);
    const int waiting = applyWaiting(writer);
    writer.commit();
    return waiting;
}
