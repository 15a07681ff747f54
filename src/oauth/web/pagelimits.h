#pragma once

#include <QObject>

class QNetworkReply;

// What a page may bring along. The browser lays out whatever it gets before anything else happens,
// remote control included; a sign-in page needs a small part of this:
//
//   documents            512 kB and 5,000 tags for all frames of a page, text only
//   scripts, pictures    4 MB together
//
// A reply that goes beyond it is aborted before the browser sees the bytes; when it is the page's
// own, the load has failed.
class PageLimits : public QObject
{
    Q_OBJECT

public:
    using QObject::QObject;

    // To be called before anybody else listens to the reply. The reply must not be compressed: a
    // compressed one is aborted, since a few bytes of it may stand for any number.
    void watch(QNetworkReply *reply);
    // Another page comes: what the last one brought is forgotten.
    void startPage();

private:
    bool takes(const QNetworkReply &reply, const QByteArray &bytes);

    qint64 mDocumentBytes = 0;
    qint64 mOtherBytes = 0;
    int mTags = 0;
};
