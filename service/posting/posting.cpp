#include "posting/posting.h"

#include "base/texts.h"
#include "feeds/asked.h"
#include "index/albumwriter.h"
#include "index/catalogue.h"
#include "index/database.h"
#include "index/remarks.h"
#include "posting/atomentry.h"
#include "posting/multipart.h"
#include "posting/newphotofile.h"
#include "scan/contentmark.h"
#include "scan/folderlist.h"

#include <algorithm>

namespace {

constexpr int badRequest = 400;
constexpr int forbidden = 403;
constexpr int notFound = 404;
constexpr int tooLarge = 413;
constexpr int unfitMedia = 415;
constexpr std::size_t longestEntry = 64 * 1024;
constexpr std::size_t longestTag = 200;
constexpr std::size_t uploadBytes = 65 * 1024 * 1024;

void sendEntry(Asked &asked, int status, FeedJson entry)
{
    asked.response.status = status;
    asked.response.set_content(entryDocument(std::move(entry)), "application/json; charset=UTF-8");
}

void sendNothing(Asked &asked)
{
    asked.response.set_content("{}", "application/json; charset=UTF-8");
}

std::string joined(const std::vector<std::string> &tags)
{
    std::string text;
    for (const std::string &tag : tags)
        text += (text.empty() ? "" : ", ") + tag;
    return text;
}

std::string extensionFor(const std::string &mimeType)
{
    return mimeType == "image/jpeg" ? ".jpg" : "." + mimeType.substr(mimeType.find('/') + 1);
}

FoundFile describe(const NewPhotoFile &file, PhotoMetadata metadata)
{
    struct stat status
    {
    };
    ::stat(file.path().c_str(), &status);
    return {file.name(), status.st_size,          timeOfChange(status), std::move(metadata), "",
            0,           contentMark(file.path())};
}

// What an upload brings: its entry, and its picture on the way into the album's folder. Further
// parts are dropped.
struct Upload
{
    explicit Upload(const std::string &folder)
        : file(folder)
    {
    }

    void beginPart(const std::string &type)
    {
        part = Part::Other;
        if (type == "application/atom+xml" && entry.empty())
            part = Part::Entry;
        else if (type.rfind("image/", 0) == 0 && !hasPicture)
            part = Part::Picture;
        hasPicture = hasPicture || part == Part::Picture;
    }
    void take(std::string_view bytes)
    {
        if (part == Part::Picture)
            file.write(bytes);
        else if (part == Part::Entry && entry.size() <= longestEntry)
            entry.append(bytes);
    }

    // False when the body has been cut or lacks a part.
    bool readFrom(const Router::Body &body, const std::string &boundary)
    {
        MultipartReader reader(
            boundary, [this](const std::string &type) { beginPart(type); },
            [this](std::string_view bytes) { take(bytes); });
        const bool isRead = body([&reader](std::string_view bytes) { reader.feed(bytes); });
        return isRead && reader.isWhole() && !entry.empty() && hasPicture;
    }

    enum class Part { Other, Entry, Picture };
    Part part = Part::Other;
    std::string entry;
    bool hasPicture = false;
    NewPhotoFile file;
};

// Nothing after a refusal.
std::optional<AtomEntry> photoEntryIn(Asked &asked, const std::string &text)
{
    std::string error = "the entry is not that of a photo";
    auto entry = text.size() <= longestEntry ? parseAtomEntry(text, &error) : std::nullopt;
    if (entry && entry->kind == AtomEntry::Kind::Photo)
        return entry;
    if (text.size() > longestEntry)
        asked.refuse(tooLarge, "the entry is too large");
    else
        asked.refuse(badRequest, error);
    return std::nullopt;
}

void refuseFile(Asked &asked, NewPhotoFile::Problem problem)
{
    switch (problem) {
    case NewPhotoFile::Problem::NoRoom:
        return asked.refuse(507, "there is no room for more photos");
    case NewPhotoFile::Problem::NoLeave:
        return asked.refuse(forbidden, "the service may not write to the album's folder");
    default:
        return asked.refuse(500, "the album's folder cannot be written");
    }
}

} // namespace

Posting::Posting(Database &database, std::string scheme)
    : mDatabase(database)
    , mScheme(std::move(scheme))
{
}

void Posting::addRoutes(Router &router)
{
    const std::string album = "api/user/*/albumid/*", photo = album + "/photoid/*";
    router.add("POST", "data/feed/" + photo, withToken(&Posting::postRemark));
    router.add("DELETE", "data/entry/" + photo + "/commentid/*",
               withToken(&Posting::deleteComment));
    router.add("DELETE", "data/entry/" + photo + "/tag/*", withToken(&Posting::deleteTag));
    router.addReader("data/feed/" + album, withToken(&Posting::postPhoto),
                     [this](const Router::Call &call, httplib::Response &response) {
                         return uploadLimit(call, response);
                     });
}

Router::Handler Posting::withToken(Answer answer)
{
    return [this, answer](const Router::Call &call, httplib::Response &response) {
        auto reader = mDatabase.read();
        Asked asked{reader, call, response, originOf(call.request, mScheme), {}, {}};
        if (asked.identify())
            (this->*answer)(asked);
    };
}

// Strangers do not get to fill the memory.
std::size_t Posting::uploadLimit(const Router::Call &call, httplib::Response &response)
{
    auto reader = mDatabase.read();
    Asked asked{reader, call, response, "", {}, {}};
    return asked.identify() ? uploadBytes : Router::standardBody;
}

void Posting::postRemark(Asked &asked)
{
    const auto photo = asked.photo();
    if (!photo)
        return;
    if (asked.call.request.body.size() > longestEntry)
        return asked.refuse(tooLarge, "the entry is too large");
    std::string error;
    const auto entry = parseAtomEntry(asked.call.request.body, &error);
    if (!entry)
        asked.refuse(badRequest, error);
    else if (entry->kind == AtomEntry::Kind::Comment)
        postComment(asked, *photo, *entry);
    else if (entry->kind == AtomEntry::Kind::Tag)
        postTag(asked, *photo, *entry);
    else
        asked.refuse(badRequest, "photos are posted to albums");
}

void Posting::postComment(Asked &asked, const PhotoRecord &photo, const AtomEntry &entry)
{
    if (entry.content.empty())
        return asked.refuse(badRequest, "the comment is empty");
    const CommentRecord comment = addComment(mDatabase, photo.id, asked.asking, entry.content);
    sendEntry(asked, 201, commentEntry(comment, photo, asked.origin));
}

void Posting::postTag(Asked &asked, const PhotoRecord &photo, const AtomEntry &entry)
{
    if (!asked.isOwn())
        return asked.refuse(forbidden, "tags are for one's own photos");
    const std::vector<std::string> tags = tagsIn(entry.title);
    if (tags.empty())
        return asked.refuse(badRequest, "the tag is empty");
    for (const std::string &tag : tags) {
        if (tag.size() > longestTag)
            return asked.refuse(badRequest, "the tag is too long");
    }
    for (const std::string &tag : tags)
        addTag(mDatabase, photo.id, asked.asking.id, tag);
    sendEntry(asked, 201, tagEntry(joined(tags), photo, asked.origin));
}

void Posting::deleteComment(Asked &asked)
{
    const auto photo = asked.photo();
    if (!photo)
        return;
    const auto id = parseNumber(asked.call.pieces[3]);
    const auto place = id ? placeOfComment(mDatabase, *id) : std::nullopt;
    if (!place || place->photoId != photo->id)
        return asked.refuse(notFound, "there is no such comment");
    if (place->author != asked.asking.id && !asked.isOwn())
        return asked.refuse(forbidden, "this comment is somebody else's");
    removeComment(mDatabase, *id);
    sendNothing(asked);
}

void Posting::deleteTag(Asked &asked)
{
    const auto photo = asked.photo();
    if (!photo)
        return;
    if (!asked.isOwn())
        asked.refuse(forbidden, "tags are for one's own photos");
    else if (!removeTag(mDatabase, photo->id, asked.call.pieces[3]))
        asked.refuse(notFound, "there is no such tag");
    else
        sendNothing(asked);
}

void Posting::postPhoto(Asked &asked)
{
    const auto album = asked.album();
    if (!album)
        return;
    if (!asked.isOwn())
        return asked.refuse(forbidden, "photos are for one's own albums");
    const std::string boundary = boundaryOf(asked.call.request.get_header_value("Content-Type"));
    if (boundary.empty())
        return asked.refuse(unfitMedia, "a photo comes as multipart/related");
    const std::string folder = folderOfAlbum(asked.session, album->id).value_or("");
    const std::string path = asked.owner.photos + (folder.empty() ? "" : "/" + folder);
    if (!liesWithin(asked.owner.photos, path))
        return asked.refuse(forbidden, "the album's folder is elsewhere");
    Upload upload(path);
    if (!upload.readFrom(asked.call.body, boundary))
        return asked.refuse(badRequest, "the body has been cut or lacks a part");
    if (const auto entry = photoEntryIn(asked, upload.entry))
        storePhoto(asked, {album->userId, folder, album->title, album->isPrivate}, *entry,
                   upload.file);
}

void Posting::storePhoto(Asked &asked, const FolderState &album, const AtomEntry &entry,
                         NewPhotoFile &file)
{
    if (!file.finish())
        return refuseFile(asked, file.problem());
    std::string error;
    auto metadata = readPhotoMetadata(file.path(), &error);
    if (!metadata)
        return asked.refuse(unfitMedia, error);
    if (!file.publish(entry.title, extensionFor(metadata->mimeType)))
        return refuseFile(asked, file.problem());
    const std::string title =
        hasPhotoName(entry.title) ? withoutExtension(entry.title) : entry.title;
    const std::int64_t id =
        addPhoto(mDatabase, album, describe(file, std::move(*metadata)), {title, entry.summary});
    file.keep();
    if (const auto photo = photoWithId(asked.session, id))
        sendEntry(asked, 201, photoEntry(*photo, asked.origin));
}
