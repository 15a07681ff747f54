#include "ui/detailnotes.h"

#include "ui/cachedlist.h"

#include <algorithm>

namespace {

constexpr int kMostComments = 100; // far more than a screen shows

} // namespace

void DetailNotes::open(const DetailPhoto &photo)
{
    mPhoto = photo;
    mCommentState = State::Waiting;
    mComments.clear();
    mTags = photo.tags;
    mCommentCount = photo.commentCount;
}

void DetailNotes::request(PackageManager::Callback callback)
{
    requestList(PHOTO_COMMENTS_LIST, callback);
    requestList(PHOTO_TAGS_LIST, callback);
}

void DetailNotes::requestList(int type, PackageManager::Callback callback)
{
    PackageProperty property = mPhoto.request(type);
    if (cachedList(property))
        take(property, NET_SUCCESS);
    else if (!PackageManager::downloadPage(property, callback))
        take(property, NET_FAILED);
}

void DetailNotes::forgetCached()
{
    for (int type : {PHOTO_COMMENTS_LIST, PHOTO_TAGS_LIST}) {
        PackageProperty property = mPhoto.request(type);
        PackageManager::removeCache(property);
    }
}

bool DetailNotes::take(const PackageProperty &property, ErrorCode code)
{
    PackageProperty wanted = mPhoto.request(property.mType);
    if (property != wanted)
        return false;
    const Package *package = code == NET_SUCCESS ? cachedList(wanted) : nullptr;
    if (property.mType == PHOTO_TAGS_LIST) {
        if (package)
            readTags(*package);
    } else if (package) {
        readComments(*package);
    } else if (mCommentState == State::Waiting) {
        mCommentState = code == NET_CONTENT_ERROR ? State::Gone : State::Failed;
    }
    return true;
}

void DetailNotes::readComments(const Package &package)
{
    mComments.clear();
    for (int i = 0; i < package.count(); ++i) {
        if (const auto *comment = package.record<Comment>(i))
            mComments.append({comment->nickname(), comment->content(), comment->createdTime()});
    }
    std::stable_sort(
        mComments.begin(), mComments.end(),
        [](const DetailComment &a, const DetailComment &b) { return a.created > b.created; });
    if (mComments.size() > kMostComments)
        mComments.resize(kMostComments);
    for (DetailComment &comment : mComments) {
        comment.author = shownText(comment.author).simplified();
        comment.text = shownText(comment.text).trimmed();
    }
    mCommentCount = package.count();
    mCommentState = State::Ready;
}

void DetailNotes::readTags(const Package &package)
{
    mTags.clear();
    for (int i = 0; i < package.count(); ++i) {
        const auto *entry = package.record<PhotoTagList>(i);
        const QStringList tags = entry ? entry->tagList() : QStringList();
        for (const QString &tag : tags)
            mTags << shownText(tag).simplified();
    }
    mTags.removeDuplicates();
}
