#include "index/remarks.h"

#include "base/texts.h"
#include "index/database.h"
#include "index/photosearch.h"

CommentRecord addComment(Database &database, std::int64_t photoId, const UserRecord &author,
                         const std::string &content)
{
    const std::string now = utcTime(currentSeconds());
    Database::Writer writer(database);
    Query(writer, "INSERT INTO comments (photo, author, content, published) VALUES (?, ?, ?, ?)",
          photoId, author.id, content, now)
        .run();
    CommentRecord comment{writer.lastId(), author.id, author.name, content, now};
    writer.commit();
    return comment;
}

std::optional<CommentPlace> placeOfComment(Database &database, std::int64_t commentId)
{
    auto reader = database.read();
    Query query(reader, "SELECT photo, author FROM comments WHERE id = ?", commentId);
    if (!query.next())
        return std::nullopt;
    return CommentPlace{query.number(0), query.number(1)};
}

bool removeComment(Database &database, std::int64_t commentId)
{
    Database::Writer writer(database);
    const bool found = Query(writer, "DELETE FROM comments WHERE id = ?", commentId).run() > 0;
    writer.commit();
    return found;
}

void addTag(Database &database, std::int64_t photoId, std::int64_t author, const std::string &tag)
{
    Database::Writer writer(database);
    Query(writer, "DELETE FROM droppedKeywords WHERE photo = ? AND tag = ?", photoId, tag).run();
    Query(writer, "INSERT OR IGNORE INTO tags (photo, tag, author) VALUES (?, ?, ?)", photoId, tag,
          author)
        .run();
    refreshPhotoSearch(writer, photoId);
    writer.commit();
}

bool removeTag(Database &database, std::int64_t photoId, const std::string &tag)
{
    Database::Writer writer(database);
    const bool found =
        Query(writer, "DELETE FROM tags WHERE photo = ? AND tag = ?", photoId, tag).run() > 0;
    // Or the file's keyword comes back when the file changes.
    if (found)
        Query(writer, "INSERT OR IGNORE INTO droppedKeywords (photo, tag) VALUES (?, ?)", photoId,
              tag)
            .run();
    refreshPhotoSearch(writer, photoId);
    writer.commit();
    return found;
}
