#pragma once

#include "data/packagemanager.h"
#include "ui/detailphoto.h"

#include <QVector>

// One comment as the photo screen shows it; plain texts of bounded length.
struct DetailComment
{
    QString author;
    QString text;
    QDateTime created; // in the zone to show
};

// What people wrote about the photo shown: its comments and tags, fetched as lists of their own.
// Until they are there the photo's own record tells the number of comments and the tags.
class DetailNotes
{
public:
    enum class State { Waiting, Ready, Failed, Gone };

    // Turns to another photo, whose notes are not known yet.
    void open(const DetailPhoto &photo);
    // Takes the lists from the cache; what is not there is downloaded and answered on the
    // call-back, which hands it to take().
    void request(PackageManager::Callback callback);
    // Has the lists fetched anew at the next request.
    void forgetCached();
    // True when the answer was for this photo.
    bool take(const PackageProperty &property, ErrorCode code);

    State commentState() const { return mCommentState; }
    int commentCount() const { return mCommentCount; }
    const QVector<DetailComment> &comments() const { return mComments; } // newest first
    const QStringList &tags() const { return mTags; }

private:
    void requestList(int type, PackageManager::Callback callback);
    void readComments(const Package &package);
    void readTags(const Package &package);

    DetailPhoto mPhoto;
    State mCommentState = State::Waiting;
    QVector<DetailComment> mComments;
    QStringList mTags;
    int mCommentCount = 0;
};
