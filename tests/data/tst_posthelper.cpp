#include "accountmanager/accountmanagerhelper.h"
#include "data/mediauploader.h"
#include "data/posthelper.h"
#include "data/testpictures.h"
#include "support/logcapture.h"
#include "support/misbehavingserver.h"
#include "support/testconfig.h"

#include <QtTest>

namespace {

const QByteArray kEntry = R"({"entry":{"title":{"$t":"x"}}})";
const char *const kCategory = "<category scheme=\"https://schemas.orvala.example/2005#kind\"    "
                              "term=\"https://schemas.orvala.example/photos/2007#";

} // namespace

// What posting sends, byte by byte, and how it takes the answers.
class TestPostHelper : public QObject
{
    Q_OBJECT

private slots:
    void init()
    {
        mLog = std::make_unique<LogCapture>();
        mServer = std::make_unique<MisbehavingServer>();
        mConfig.write("[Service]\nFeedBase=" + mServer->url("").toUtf8() + '\n');
        AccountManagerHelper::setAccessToken("to/k&n");
    }

    void cleanup()
    {
        mServer.reset();
        mLog.reset();
    }

    void postsAComment()
    {
        mServer->enqueue(MisbehavingServer::answer("  " + kEntry));
        QString comment = QString::fromUtf8("caf\u00e9 <3 &amp; %1 \u20ac \U0001f600\x01");
        QCOMPARE(PostHelper::addComment("me", "a b", "7", comment), NET_SUCCESS);
        QCOMPARE(comment.mid(0, 9), QString::fromUtf8("caf\u00e9 &lt;"));
        QCOMPARE(last().method, QByteArray("POST"));
        QCOMPARE(last().path, QByteArray("/data/feed/api/user/me/albumid/a%20b/photoid/7"
                                         "?access_token=to%2Fk%26n&alt=json"));
        QCOMPARE(last().headers.value("content-type"), QByteArray("application/atom+xml"));
        QCOMPARE(last().body,
                 QByteArray("<entry xmlns='http://www.w3.org/2005/Atom'>  "
                            "<content>caf\xe9 &lt;3 &amp; %1 &#8364; &#128512;</content>  ") +
                     kCategory + "comment\"/></entry>");
        mServer->enqueue(MisbehavingServer::answer(""));
        QCOMPARE(PostHelper::addComment("me", "a", "7", comment), NET_REJECTED);
    }

    void postsATag()
    {
        mServer->enqueue(MisbehavingServer::answer(kEntry));
        mServer->enqueue(MisbehavingServer::answer(R"({"entry":{"Title":1}})"));
        QString tag = "Q&A";
        QCOMPARE(PostHelper::addTag("me", "a", "7", tag), NET_SUCCESS);
        QCOMPARE(last().body,
                 "<entry xmlns='http://www.w3.org/2005/Atom'>  <title>Q&amp;A</title>  " +
                     QByteArray(kCategory) + "tag\"/></entry>");
        QCOMPARE(PostHelper::addTag("me", "a", "7", tag), NET_REJECTED);
    }

    void deletes()
    {
        mServer->enqueue(MisbehavingServer::answer(""));
        QCOMPARE(PostHelper::deleteTag("me", "a", "7", "50% a/b?#c"), NET_SUCCESS);
        QCOMPARE(last().method, QByteArray("DELETE"));
        QCOMPARE(last().path, QByteArray("/data/entry/api/user/me/albumid/a/photoid/7/tag/"
                                         "50%25%20a%2Fb%3F%23c?access_token=to%2Fk%26n&alt=json"));
        mServer->enqueue(MisbehavingServer::answer("", 404));
        QCOMPARE(PostHelper::deleteTag("me", "a", "7", "x"), NET_CONTENT_ERROR);
        mServer->enqueue(MisbehavingServer::answer("", 404));
        QCOMPARE(PostHelper::deleteComment("me", "a", "7", "c1"), NET_SUCCESS);
        QCOMPARE(last().path, QByteArray("/data/entry/api/user/me/albumid/a/photoid/7/commentid/c1"
                                         "?access_token=to%2Fk%26n&alt=json"));
    }

    void uploadsAPhoto()
    {
        const QByteArray bytes = encoded(plain(3, 2), "PNG");
        const QString path = file("p.png", bytes);

        mServer->enqueue(MisbehavingServer::answer(kEntry));
        QCOMPARE(MediaUploader::startToUpload(path, "Sea & sand", "me", "a1", "<By day", false),
                 NET_SUCCESS);
        QCOMPARE(last().path,
                 QByteArray("/data/feed/api/user/me/albumid/a1?access_token=to%2Fk%26n&alt=json"));
        const QByteArray body =
            "\nMedia multipart posting\n--END_OF_PART\nContent-Type:application/atom+xml\n\n"
            "<entry xmlns='http://www.w3.org/2005/Atom'>   <title>Sea &amp; sand</title>   "
            "<summary>&lt;By day</summary>   " +
            QByteArray(kCategory) +
            "photo\"/> </entry>\n--END_OF_PART\nContent-Type:image/png\n\n" + bytes +
            "\n--END_OF_PART--";
        QCOMPARE(last().body, body);
        QCOMPARE(last().headers.value("content-type"),
                 "multipart/related; boundary=END_OF_PART Content-Length:" +
                     QByteArray::number(body.size()) + " MIME-version:1.0");
    }

    void refusesFiles()
    {
        const auto upload = [](const QString &path, bool busy) {
            return MediaUploader::startToUpload(path, "t", "me", "a", "s", busy);
        };
        QCOMPARE(upload("anything", true), ErrorCode(MediaUploader::Busy));
        QCOMPARE(upload(file("text.jpg", "no picture"), false),
                 ErrorCode(MediaUploader::NotAnImage));
        QCOMPARE(upload(file("empty.png", ""), false), ErrorCode(MediaUploader::NotAnImage));
        QByteArray claimed = encoded(plain(3, 2), "PNG"); // 100,000 pixels wide and high
        claimed.replace(16, 8, QByteArray("\0\x01\x86\xa0\0\x01\x86\xa0", 8));
        QCOMPARE(upload(file("claimed.png", claimed), false), ErrorCode(MediaUploader::NotAnImage));
        QVERIFY(mServer->requests().isEmpty());
    }

private:
    MisbehavingServer::Request last() const { return mServer->requests().last(); }
    QString file(const QString &name, const QByteArray &bytes) const
    {
        QFile file(mFolder.filePath(name));
        if (!file.open(QIODevice::WriteOnly) || file.write(bytes) != bytes.size())
            qFatal("cannot write a file");
        return file.fileName();
    }

    QTemporaryDir mFolder;
    TestConfig mConfig;
    std::unique_ptr<LogCapture> mLog;
    std::unique_ptr<MisbehavingServer> mServer;
};

QTEST_MAIN(TestPostHelper)
#include "tst_posthelper.moc"
