#pragma once

#include "data/photomanager.h"
#include "ui/detailphoto.h"

#include <QObject>
#include <QTimer>

#include <memory>

class DetailStage;
class ImageTarget;

// Brings the pictures of the photo screen: the thumbnail at once, the large photo as soon as the
// user does not rush past it, a sharper one for magnifying, and the next large photo ahead of time.
// Download delivers them, each to who still wants it.
class DetailPictures : public QObject
{
    Q_OBJECT

public:
    explicit DetailPictures(DetailStage *stage, QObject *parent = nullptr);
    ~DetailPictures() override;

    // Turns to another photo. nextUrl is the large photo to have ready, "" for none.
    void show(const DetailPhoto &photo, const QString &nextUrl);
    // Fits the photo anew, or asks for it again.
    void refit();
    // The photo for a target that magnifies it, in so many pixels' width.
    void showSharper(ImageTarget *target, int width);
    // Nothing is wanted any longer.
    void stop();

    // One more small picture.
    static void showSmall(ImageTarget *target, QString url);

signals:
    // The user stays with the photo.
    void settled();

private:
    class Preview;

    static void largePhotoCB(QString &url, ErrorCode code);
    void fetchLarge(ImageTarget *target, QString url);
    void largeFinished(const QString &url, ErrorCode code);
    void showPreview();
    void settle();
    void prefetch();

    static DetailPictures *mInstance; // whom the call-back reaches

    DetailStage *mStage;
    std::unique_ptr<Preview> mPreview;
    DetailPhoto mPhoto;
    QString mNextUrl;
    bool mIsFetched = false; // the large photo has been asked for
    QTimer mSettle;
};
