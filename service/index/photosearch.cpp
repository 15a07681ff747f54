#include "index/photosearch.h"

#include "index/database.h"
#include "index/searchtext.h"
#include "index/users.h"

#include <sqlite3.h>

#include <algorithm>

namespace {

using Namesakes = std::vector<std::pair<std::string, std::int64_t>>; // names in pieces, user ids

Namesakes usersByName(Session &session)
{
    Namesakes users;
    for (const UserRecord &user : allUsers(session))
        users.emplace_back(" " + searchText(user.name), user.id);
    return users;
}

// Nobody turns pages so far, and the order among very many is worth little: of those that fit
// equally well only the latest are compared. A word that all photos have is found as fast as
// others.
constexpr std::int64_t mostRanked = 3000;
// What is typed with a remote control is shorter.
constexpr std::size_t longestText = 300;
constexpr std::size_t mostWords = 20;

std::string matchOf(const std::string &word, const char *ending, const Namesakes &users)
{
    std::string match = "({title caption tags album date} : \"" + word + "\"" + ending;
    for (const auto &[name, id] : users) {
        if (name.find(" " + word) != std::string::npos)
            match += " OR people : u" + std::to_string(id);
    }
    return match + ")";
}

// MATCH expressions for photos that hold all words.
struct Expressions
{
    std::string all;
    std::string whole; // those that hold them whole
    std::string rest;  // the others
};

Expressions expressionsOf(Session &session, const std::vector<std::string> &words)
{
    const Namesakes users = usersByName(session);
    std::string whole, all;
    for (const std::string &word : words) {
        const char *const joint = whole.empty() ? "" : " AND ";
        whole += joint + matchOf(word, "", users);
        all += joint + matchOf(word, " *", users);
    }
    return {all, whole, "(" + all + ") NOT (" + whole + ")"};
}

std::int64_t countOf(Session &session, const std::string &expression)
{
    Query query(session, "SELECT count(*) FROM photoSearch WHERE photoSearch MATCH ?", expression);
    return query.next() ? query.number(0) : 0;
}

void addIds(FoundPhotos &found, Query &&query)
{
    while (query.next())
        found.ids.push_back(query.number(0));
}

// Adds what the page shows of the matches, of which `before` others stand in front.
void addMatches(FoundPhotos &found, Session &session, const std::string &expression,
                const Page &page, std::int64_t before)
{
    const std::int64_t wanted = page.count - static_cast<std::int64_t>(found.ids.size());
    const std::int64_t first = std::max<std::int64_t>(page.start - 1 - before, 0);
    const std::int64_t ranked = std::clamp<std::int64_t>(mostRanked - first, 0, wanted);
    if (ranked > 0)
        addIds(found, Query(session,
                            "SELECT id FROM (SELECT rowid AS id, "
                            "bm25(photoSearch, 10, 4, 8, 3, 2, 1) AS score FROM photoSearch "
                            "WHERE photoSearch MATCH ? ORDER BY rowid DESC LIMIT ?) "
                            "ORDER BY score, id DESC LIMIT ? OFFSET ?",
                            expression, mostRanked, ranked, first));
    if (wanted > ranked)
        addIds(found, Query(session,
                            "SELECT rowid FROM photoSearch WHERE photoSearch MATCH ? "
                            "ORDER BY rowid DESC LIMIT ? OFFSET ?",
                            expression, wanted - ranked, std::max(first, mostRanked)));
}

void callWithText(sqlite3_context *context, sqlite3_value *value,
                  std::string (*function)(const std::string &))
{
    const auto *text = reinterpret_cast<const char *>(sqlite3_value_text(value));
    const auto size = static_cast<std::size_t>(sqlite3_value_bytes(value));
    const std::string result = function(text ? std::string(text, size) : std::string());
    sqlite3_result_text(context, result.data(), static_cast<int>(result.size()), SQLITE_TRANSIENT);
}

} // namespace

FoundPhotos searchPhotos(Session &session, const std::string &text, const Page &page)
{
    FoundPhotos found;
    std::vector<std::string> words = searchWords(text.substr(0, longestText));
    if (words.empty())
        return found;
    words.resize(std::min(words.size(), mostWords));
    const Expressions expressions = expressionsOf(session, words);
    const std::int64_t whole = countOf(session, expressions.whole);
    found.total = countOf(session, expressions.all);
    if (page.start <= whole)
        addMatches(found, session, expressions.whole, page, 0);
    if (page.start - 1 + page.count > whole && found.total > whole)
        addMatches(found, session, expressions.rest, page, whole);
    return found;
}

void refreshPhotoSearch(Session &session, std::int64_t photoId)
{
    Query(session, "DELETE FROM photoSearch WHERE rowid = ?", photoId).run();
    Query(session, REFRESH_ALL_PHOTO_SEARCH "AND p.id = ?", photoId).run();
}

void refreshAlbumSearch(Session &session, std::int64_t albumId)
{
    Query(session, "DELETE FROM photoSearch WHERE rowid IN (SELECT id FROM photos WHERE album = ?)",
          albumId)
        .run();
    Query(session, REFRESH_ALL_PHOTO_SEARCH "AND a.id = ?", albumId).run();
}

void addSearchFunctions(SQLite::Database &database)
{
    database.createFunction("searchText", 1, true, nullptr,
                            [](sqlite3_context *context, int, sqlite3_value **values) {
                                callWithText(context, values[0], searchText);
                            });
    database.createFunction("searchDate", 1, true, nullptr,
                            [](sqlite3_context *context, int, sqlite3_value **values) {
                                callWithText(context, values[0], searchDate);
                            });
}
