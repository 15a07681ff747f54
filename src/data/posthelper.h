#pragma once

#include "network/errorcode.h"

#include <QByteArray>
#include <QPointer>
#include <QString>

class Connection;

// Writes to the service: comments and tags of a photo, and new photos. Every operation blocks, in
// an event loop of its own, until the answer is there, the request times out or cancel() ends it:
// its caller must expect to be deleted meanwhile. 0 is success; -1 means that there was no
// connection or that the service did not answer with the new entry; other codes are the
// connection's.
class PostHelper
{
public:
    // The text is replaced by its escaped form.
    static ErrorCode addComment(const QString &userId, const QString &albumId,
                                const QString &photoId, QString &comment);
    static ErrorCode addTag(const QString &userId, const QString &albumId, const QString &photoId,
                            QString &tag);
    // 0 whatever the service says: whether the comment is gone, the list of comments tells.
    static ErrorCode deleteComment(const QString &userId, const QString &albumId,
                                   const QString &photoId, const QString &commentId);
    static ErrorCode deleteTag(const QString &userId, const QString &albumId,
                               const QString &photoId, const QString &tag);
    static ErrorCode postNewPhoto(const QString &userId, const QString &albumId,
                                  const QString &title, const QString &summary, QString mimeType,
                                  const QByteArray &image, qint64 imageSize);

    // The transport: both read the whole answer, trimmed, into the response.
    static ErrorCode postData(const QString &url, const QString &xml, QString &response);
    static ErrorCode uploadNewPhotoData(const QByteArray &image, qint64 size, const QString &url,
                                        const QString &body, QString &response);

    // Text as it may stand in an element; what is escaped already stays as it is.
    static QString escapeXml(QString text);

    // Ends the operation under way, if there is one; its code is NET_CANCELED.
    static void cancel();

private:
    struct LogTexts;

    static ErrorCode send(const QString &url, const QString &contentType, const QByteArray &body,
                          const LogTexts &texts, QString &response);
    static ErrorCode read(Connection &connection, const LogTexts &texts, QString &response);
    static ErrorCode deleteEntry(const QString &url);

    static QPointer<Connection> mRunning;
};
