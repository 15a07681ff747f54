#pragma once

#include "network/errorcode.h"
#include "ui/slidelabel.h"

#include <QHash>
#include <QObject>
#include <QSet>
#include <QStringList>
#include <QTimer>

// The photos of the slide show on their way to its label: shows what is there, asks for what is
// not, and has the next ones fetched, decoded and scaled before their time. What is no longer
// wanted is given up, so that photos that never come do not keep the others waiting. One at a time.
//
//   show(url) ── prepared or in the cache ─▶ label
//       └─ else: thumbnail or loading picture; Download's call-back puts the photo into the label
//   want(urls) ─▶ PhotoManager ─▶ arrivedCB ─▶ scaled in a moment of its own ─▶ arrived()
class SlidePhotos : public QObject
{
    Q_OBJECT

public:
    SlidePhotos(SlideLabel *label, const SlideOptions &options, QObject *parent = nullptr);
    ~SlidePhotos() override;

    // Shows the photo, or what stands for it until it comes.
    void show(const QString &url, const QString &thumbnailUrl, SlideLabel::Change change);
    // The photos that follow, the next one first: the others than these and the one shown are given
    // up.
    void want(const QStringList &urls);
    // Gives everything up and forgets which ones have failed.
    void clear();

    bool isPrepared(const QString &url) const { return mPrepared.contains(url); }
    // Nothing is to be waited for: it can be shown, or will not come any more.
    bool isSettled(const QString &url) const;
    bool hasFailed(const QString &url) const { return mFailed.contains(url); }

signals:
    // A photo that was asked for has come, or has failed.
    void arrived(const QString &url);

private:
    bool isThere(const QString &url) const;
    static void arrivedCB(QString &url, ErrorCode code);
    void take(const QString &url, ErrorCode code);
    bool request(const QString &url);
    void giveUp(const QString &url);
    void prepareNext();
    SlidePicture prepared(const QString &url);
    bool showNow(const QString &url, SlideLabel::Change change);
    void standIn(const QString &thumbnailUrl);

    static SlidePhotos *mInstance;

    SlideLabel *mLabel;
    SlideOptions mOptions;
    QString mShown;
    bool mIsAwaited = false; // what is shown stands in for the photo, which Download will put there
    QString mBefore;         // shown before that: the way back is as short
    QStringList mWanted;
    QSet<QString> mAsked; // requested, and not arrived yet
    QSet<QString> mGone;  // arrived while wanted: not fetched ahead again
    QSet<QString> mFailed;
    QHash<QString, SlidePicture> mPrepared;
    QTimer mPrepareTimer;
};
