#include "data/posthelper.h"

#include "accountmanager/accountmanagerhelper.h"
#include "base/log.h"
#include "network/connection.h"
#include "network/systemconfig.h"

#include <QRegularExpression>
#include <QUrl>

#include <limits>
#include <memory>
#include <new>

QPointer<Connection> PostHelper::mRunning;

// What each of the two transports says in the log.
struct PostHelper::LogTexts
{
    const char *noConnection;
    const char *nothingAvailable;
    const char *noMemory;
    const char *unreadable;
    const char *answer;
};

namespace {

const QString PHOTO_URL_BOILERPLATE =
    QStringLiteral("/data/feed/api/user/%1/albumid/%2/photoid/%3?access_token=%4&alt=json");
const QString COMMENT_URL_BOILERPLATE = QStringLiteral(
    "/data/entry/api/user/%1/albumid/%2/photoid/%3/commentid/%4?access_token=%5&alt=json");
const QString TAG_URL_BOILERPLATE =
    QStringLiteral("/data/entry/api/user/%1/albumid/%2/photoid/%3/tag/%4?access_token=%5&alt=json");
const QString POST_NEW_PHOTO_URL =
    QStringLiteral("/data/feed/api/user/%1/albumid/%2?access_token=%3&alt=json");

const QString COMMENT_XML_BOILERPLATE =
    QStringLiteral("<entry xmlns='http://www.w3.org/2005/Atom'>  <content>%1</content>  "
                   "<category scheme=\"https://schemas.orvala.example/2005#kind\"    "
                   "term=\"https://schemas.orvala.example/photos/2007#comment\"/></entry>");
const QString TAG_XML_BOILERPLATE =
    QStringLiteral("<entry xmlns='http://www.w3.org/2005/Atom'>  <title>%1</title>  "
                   "<category scheme=\"https://schemas.orvala.example/2005#kind\"    "
                   "term=\"https://schemas.orvala.example/photos/2007#tag\"/></entry>");
const QString POST_NEW_PHOTO_METADATA =
    QStringLiteral("<entry xmlns='http://www.w3.org/2005/Atom'>   <title>%1</title>   "
                   "<summary>%2</summary>   "
                   "<category scheme=\"https://schemas.orvala.example/2005#kind\"    "
                   "term=\"https://schemas.orvala.example/photos/2007#photo\"/> </entry>");

const char *const kEndOfParts = "\n--END_OF_PART--";

// Encoded as a whole: a tag may hold any character, a slash among them.
QString encoded(const QString &text)
{
    return QString::fromLatin1(QUrl::toPercentEncoding(text));
}

QString token()
{
    return encoded(AccountManagerHelper::getAccessToken());
}

QString urlOf(const QString &path)
{
    return SystemConfig::feedBase() + path;
}

QString urlOfPhoto(const QString &userId, const QString &albumId, const QString &photoId)
{
    return urlOf(
        PHOTO_URL_BOILERPLATE.arg(encoded(userId), encoded(albumId), encoded(photoId), token()));
}

bool isAllowedInXml(uint character)
{
    if (character < 0x20)
        return character == '\t' || character == '\n' || character == '\r';
    return !QChar::isSurrogate(character) && character != 0xfffe && character != 0xffff;
}

// The body of an entry: characters that Latin-1 lacks become references, those that XML forbids are
// left out.
QByteArray latin1Xml(const QString &xml)
{
    QByteArray body;
    const QVector<uint> characters = xml.toUcs4();
    for (uint character : characters) {
        if (!isAllowedInXml(character))
            continue;
        if (character <= 0xff)
            body += char(character);
        else
            body += "&#" + QByteArray::number(character) + ';';
    }
    return body;
}

} // namespace

QString PostHelper::escapeXml(QString text)
{
    static const QRegularExpression bareAmpersand(QStringLiteral("&(?!amp;)"));
    text.replace(bareAmpersand, QStringLiteral("&amp;"));
    text.replace(QLatin1Char('"'), QStringLiteral("&quot;"));
    text.replace(QLatin1Char('<'), QStringLiteral("&lt;"));
    text.replace(QLatin1Char('>'), QStringLiteral("&gt;"));
    return text;
}

ErrorCode PostHelper::addComment(const QString &userId, const QString &albumId,
                                 const QString &photoId, QString &comment)
{
    const QString url = urlOfPhoto(userId, albumId, photoId);
    comment = escapeXml(comment);
    const QString xml = COMMENT_XML_BOILERPLATE.arg(comment);
    logLine("PostHelper::addComment url = ", url);
    logLine("PostHelper::addComment commentXml = ", xml);
    QString response;
    return postData(url, xml, response);
}

ErrorCode PostHelper::addTag(const QString &userId, const QString &albumId, const QString &photoId,
                             QString &tag)
{
    const QString url = urlOfPhoto(userId, albumId, photoId);
    tag = escapeXml(tag);
    const QString xml = TAG_XML_BOILERPLATE.arg(tag);
    logLine("PostHelper::addTag url = ", url);
    logLine("PostHelper::addTag tagXml = ", xml);
    QString response;
    const bool isAdded =
        postData(url, xml, response) == NET_SUCCESS && response.contains(QLatin1String("title"));
    return isAdded ? NET_SUCCESS : NET_REJECTED;
}

ErrorCode PostHelper::deleteComment(const QString &userId, const QString &albumId,
                                    const QString &photoId, const QString &commentId)
{
    const QString url = urlOf(COMMENT_URL_BOILERPLATE.arg(
        encoded(userId), encoded(albumId), encoded(photoId), encoded(commentId), token()));
    logLine("PostHelper::deleteComment url = ", url);
    deleteEntry(url);
    return NET_SUCCESS;
}

ErrorCode PostHelper::deleteTag(const QString &userId, const QString &albumId,
                                const QString &photoId, const QString &tag)
{
    const QString url = urlOf(TAG_URL_BOILERPLATE.arg(encoded(userId), encoded(albumId),
                                                      encoded(photoId), encoded(tag), token()));
    logLine("PostHelper::deleteTag url = ", url);
    return deleteEntry(url);
}

ErrorCode PostHelper::deleteEntry(const QString &url)
{
    const QPointer<Connection> connection = Connection::createConfiguredConnection();
    if (!connection) {
        logLine("Failed to allocate a connection!");
        return NET_REJECTED;
    }
    mRunning = connection;
    const ErrorCode code = connection->deleteResource(url);
    if (connection)
        Connection::removeConnection(connection);
    return code;
}

ErrorCode PostHelper::postData(const QString &url, const QString &xml, QString &response)
{
    static const LogTexts texts{"Failed to allocate a connection!",
                                "Error occurs when getAvailable", "Failed to allocate memory!",
                                "Error occurs when readData", "PostHelper::postData outBuf"};
    return send(url, QStringLiteral("application/atom+xml"), latin1Xml(xml), texts, response);
}

ErrorCode PostHelper::send(const QString &url, const QString &contentType, const QByteArray &body,
                           const LogTexts &texts, QString &response)
{
    const QPointer<Connection> connection = Connection::createConfiguredConnection();
    if (!connection) {
        logLine(texts.noConnection);
        return NET_REJECTED;
    }
    mRunning = connection;
    ErrorCode code = connection->post(url, contentType, body);
    if (code != NET_SUCCESS)
        logLine("Network Error!");
    else
        code = connection ? read(*connection, texts, response) : NET_CANCELED;
    if (connection)
        Connection::removeConnection(connection);
    return code;
}

// A successful write is answered with the entry written.
ErrorCode PostHelper::read(Connection &connection, const LogTexts &texts, QString &response)
{
    const qint64 available = connection.getAvailable();
    if (available == -1) {
        logLine(texts.nothingAvailable);
        return NET_REJECTED;
    }
    std::unique_ptr<char[]> buffer;
    if (available < std::numeric_limits<int>::max())
        buffer.reset(new (std::nothrow) char[size_t(available) + 1]());
    if (!buffer) {
        logLine(texts.noMemory);
        return NET_OUT_OF_MEMORY;
    }
    if (connection.readData(buffer.get(), available) < available) {
        logLine(texts.unreadable);
        return NET_REJECTED;
    }
    const QString text = QString::fromUtf8(buffer.get(), int(available));
    logLine(texts.answer, text);
    response = text.trimmed();
    if (response.startsWith(QLatin1Char('{')))
        return NET_SUCCESS;
    logLine("Error: operation rejected by server!");
    return NET_REJECTED;
}

ErrorCode PostHelper::postNewPhoto(const QString &userId, const QString &albumId,
                                   const QString &title, const QString &summary, QString mimeType,
                                   const QByteArray &image, qint64 imageSize)
{
    const QString url = urlOf(POST_NEW_PHOTO_URL.arg(encoded(userId), encoded(albumId), token()));
    // Escaped like the notes: the title may be a file's name, and "&" alone is no XML.
    const QString metadata = POST_NEW_PHOTO_METADATA.arg(escapeXml(title), escapeXml(summary));
    const QString body = QStringLiteral("\nMedia multipart posting\n") +
                         QStringLiteral("--END_OF_PART\n") +
                         QStringLiteral("Content-Type:application/atom+xml\n\n") + metadata +
                         QStringLiteral("\n") + QStringLiteral("--END_OF_PART\n") +
                         QStringLiteral("Content-Type:") + mimeType + QStringLiteral("\n\n");
    logLine("PostHelper::postNewPhoto url=", url);
    logLine("PostHelper::postNewPhoto metaData=", metadata);
    QString response;
    const ErrorCode code = uploadNewPhotoData(image, imageSize, url, body, response);
    logLine("PostHelper::postNewPhoto responseData=", response);
    return code;
}

ErrorCode PostHelper::uploadNewPhotoData(const QByteArray &image, qint64 size, const QString &url,
                                         const QString &body, QString &response)
{
    static const LogTexts texts{"PostHelper::uploadNewPhotoData Failed to allocate a connection!",
                                "PostHelper::uploadNewPhotoData(Error occurs when getAvailable",
                                "PostHelper::uploadNewPhotoData Failed to allocate memory!",
                                "PostHelper::uploadNewPhotoData Error occurs when readData",
                                "PostHelper::uploadNewPhotoData outBuf"};
    const QByteArray data = latin1Xml(body) + image.left(int(size)) + kEndOfParts;
    const QString contentType =
        QStringLiteral("multipart/related; boundary=END_OF_PART Content-Length:") +
        QString::number(data.size()) + QStringLiteral(" MIME-version:1.0");
    return send(url, contentType, data, texts, response);
}

void PostHelper::cancel()
{
    if (mRunning)
        Connection::removeConnection(mRunning);
}
