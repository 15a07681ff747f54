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

#include <sys/stat.h>

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
constexpr std::int64_t nanoseconds = 1'000'000'000;

void sendEntry(Asked &asked, int status, FeedJson entry)
{
    asked.response.status = status;
    asked.response.set_content(entryDocument(std::move(entry)), "application/json; charset=UTF-8");
}

void sendNothing(Asked &asked)
{
    asked.response.set_content("{}", "application/json; charset=UTF-8");
}

// Readers split a list of tags at these two characters, so no tag can hold them.
std::vector<std::string> tagsIn(std::string text)
{
    std::replace_if(
        text.begin(), text.end(), [](char c) { return c == '\n' || c == '\t'; }, ' ');
    std::vector<std::string> tags;
    for (std::size_t start = 0; start < text.size();) {
        const std::size_t end = std::min(text.find(", ", start), text.size());
        const std::size_t first = text.find_first_not_of(" ,", start);
        if (first < end)
            tags.push_back(text.substr(first, text.find_last_not_of(" ,", end - 1) + 1 - first));
        start = end + 2;
    }
    return tags;
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
    return {file.name(),
            status.st_size,
            status.st_mtim.tv_sec * nanoseconds + status.st_mtim.tv_nsec,
            std::move(metadata),
            "",
            0,
            contentMark(file.path())};
}

const BodyPart *partOfType(const std::vector<BodyPart> &parts, const std::string &prefix)
{
    const auto found = std::find_if(parts.begin(), parts.end(), [&](const BodyPart &part) {
        return part.contentType.rfind(prefix, 0) == 0;
    });
    return found == parts.end() ? nullptr : &*found;
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
    router.add("POST", "data/feed/" + album, withToken(&Posting::postPhoto),
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
    const auto parts = partsOf(asked.call.request.body, boundary);
    const BodyPart *metadata = parts ? partOfType(*parts, "application/atom+xml") : nullptr;
    const BodyPart *image = parts ? partOfType(*parts, "image/") : nullptr;
    if (!metadata || !image)
        return asked.refuse(badRequest, "the body has been cut or lacks a part");
    std::string error;
    const auto entry = parseAtomEntry(std::string(metadata->content), &error);
    if (!entry || entry->kind != AtomEntry::Kind::Photo)
        return asked.refuse(badRequest, entry ? "the entry is not that of a photo" : error);
    storePhoto(asked, *album, *entry, image->content);
}

void Posting::storePhoto(Asked &asked, const AlbumRecord &album, const AtomEntry &entry,
                         std::string_view bytes)
{
    const std::string folder = folderOfAlbum(asked.session, album.id).value_or("");
    NewPhotoFile file(asked.owner.photos + (folder.empty() ? "" : "/" + folder));
    if (!liesWithin(asked.owner.photos, file.folder()))
        return asked.refuse(forbidden, "the album's folder is elsewhere");
    if (!file.write(bytes))
        return asked.refuse(507, "the album's folder takes no more photos");
    std::string error;
    auto metadata = readPhotoMetadata(file.path(), &error);
    if (!metadata)
        return asked.refuse(unfitMedia, error);
    if (!file.publish(entry.title, extensionFor(metadata->mimeType)))
        return asked.refuse(507, "the album's folder takes no more photos");
    const std::string title =
        hasPhotoName(entry.title) ? withoutExtension(entry.title) : entry.title;
    const std::int64_t id =
        addPhoto(mDatabase, {album.userId, folder, album.title, album.isPrivate},
                 describe(file, std::move(*metadata)), {title, entry.summary});
    file.keep();
    if (const auto photo = photoWithId(asked.session, id))
        sendEntry(asked, 201, photoEntry(*photo, asked.origin));
}
