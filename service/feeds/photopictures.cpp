#include "feeds/photopictures.h"

#include "base/secrets.h"
#include "base/texts.h"
#include "feeds/feedwriter.h"
#include "feeds/shownphotos.h"
#include "http/filebody.h"
#include "index/catalogue.h"
#include "index/database.h"
#include "pictures/thumbnailstore.h"

#include <unistd.h>

#include <optional>

namespace {

constexpr std::int64_t widest = 16'384;
constexpr int notFound = 404;

// The number in "s336"; nothing if it is not of this form.
std::optional<int> widthOf(const std::string &piece)
{
    if (piece.empty() || piece[0] != 's')
        return std::nullopt;
    const auto width = parseNumber(std::string_view(piece).substr(1));
    if (!width || *width < 1 || *width > widest)
        return std::nullopt;
    return static_cast<int>(*width);
}

bool isUnchanged(const httplib::Request &request, const std::string &tag)
{
    const std::string known = request.get_header_value("If-None-Match");
    return known == "*" || known.find(tag) != std::string::npos;
}

// The picture may change under its address, but seldom: a client may keep it for a day.
void setCaching(httplib::Response &response, const std::string &tag)
{
    response.set_header("ETag", tag);
    response.set_header("Cache-Control", "private, max-age=86400");
}

// False when it is the file at the path itself and cannot be read.
bool answerWith(httplib::Response &response, const std::string &path,
                ThumbnailStore::Result &picture)
{
    if (picture.isOriginal)
        return answerWithFile(response, path, picture.mimeType);
    response.set_header("Content-Type", picture.mimeType);
    response.body = std::move(picture.bytes);
    return true;
}

} // namespace

PhotoPictures::PhotoPictures(Database &database, ThumbnailStore &store, ShownPhotos &shown)
    : mDatabase(database)
    , mStore(store)
    , mShown(shown)
{
}

void PhotoPictures::addRoutes(Router &router)
{
    router.add("GET", "photos/*/*", [this](const Router::Call &call, httplib::Response &response) {
        answer(call.pieces[0], 0, call.request, response);
    });
    router.add("GET", "photos/*/*/*",
               [this](const Router::Call &call, httplib::Response &response) {
                   if (const auto width = widthOf(call.pieces[1]))
                       answer(call.pieces[0], *width, call.request, response);
                   else
                       answerError(response, notFound, "there is no picture of this size");
               });
}

void PhotoPictures::answer(const std::string &key, int width, const httplib::Request &request,
                           httplib::Response &response)
{
    std::optional<PhotoFile> file;
    {
        auto reader = mDatabase.read(); // not kept while the picture is made
        file = fileWithKey(reader, key);
    }
    if (!file || !liesWithin(file->folder, file->path))
        return answerError(response, notFound, "there is no such photo");
    if (!file->isShown && (width == 0 || width > widestThumbnail))
        mShown.note(file->photoId);
    const std::string tag =
        '"' + fingerprint(file->identity).substr(0, 32) + "-" + std::to_string(width) + '"';
    if (isUnchanged(request, tag)) {
        setCaching(response, tag);
        response.status = 304;
        return;
    }
    ThumbnailStore::Result picture = mStore.picture(file->path, file->identity, width);
    if (picture.ok() && answerWith(response, file->path, picture))
        return setCaching(response, tag);
    const bool isThere = ::access(file->path.c_str(), R_OK) == 0;
    answerError(response, isThere ? 415 : notFound,
                picture.ok() ? "the file cannot be read" : picture.error);
}
