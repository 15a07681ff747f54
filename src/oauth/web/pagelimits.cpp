#include "oauth/web/pagelimits.h"

#include <QNetworkReply>

#include <algorithm>

namespace {

constexpr qint64 kMostDocumentBytes = 512 * 1024, kMostOtherBytes = 4 * 1024 * 1024;
constexpr int kMostTags = 5000;

// Anything else, an unknown type included, may be laid out as a document.
bool isDocument(const QNetworkReply &reply)
{
    const QByteArray type = reply.rawHeader("Content-Type").trimmed().toLower();
    return !type.startsWith("image/") && !type.startsWith("font/") &&
           !type.startsWith("text/css") && !type.contains("javascript");
}

bool isCompressed(const QNetworkReply &reply)
{
    const QByteArray encoding = reply.rawHeader("Content-Encoding").trimmed().toLower();
    return !encoding.isEmpty() && encoding != "identity";
}

// A line of control characters takes the browser a hundred times as long as one of letters.
bool isBinary(const QByteArray &bytes)
{
    return std::any_of(bytes.begin(), bytes.end(), [](char byte) {
        return byte >= 0 && byte < ' ' && byte != '\t' && byte != '\n' && byte != '\r' &&
               byte != '\f';
    });
}

} // namespace

void PageLimits::watch(QNetworkReply *reply)
{
    connect(reply, &QNetworkReply::readyRead, this, [this, reply] {
        if (takes(*reply, reply->peek(reply->bytesAvailable())))
            return;
        reply->readAll(); // else the browser would, in spite of the abort
        reply->abort();
    });
}

void PageLimits::startPage()
{
    mDocumentBytes = mOtherBytes = 0;
    mTags = 0;
}

// The browser reads all that is there each time; where it does not, the rest counts twice.
bool PageLimits::takes(const QNetworkReply &reply, const QByteArray &bytes)
{
    if (isCompressed(reply))
        return false;
    if (!isDocument(reply))
        return (mOtherBytes += bytes.size()) <= kMostOtherBytes;
    mDocumentBytes += bytes.size();
    mTags += bytes.count('<');
    return mDocumentBytes <= kMostDocumentBytes && mTags <= kMostTags && !isBinary(bytes);
}
