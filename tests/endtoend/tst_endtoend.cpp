#include "app/mainapplication.h"
#include "common/ui/remotekeys.h"
#include "data/mediauploader.h"
#include "endtoend/albumservice.h"
#include "endtoend/television.h"
#include "platform/ipc.h"
#include "res/resources.h"
#include "support/misbehavingserver.h"
#include "ui/homewidget.h"
#include "ui/screentexts.h"
#include "ui/upwidget.h"

#include <QDir>
#include <QJsonArray>
#include <QJsonDocument>
#include <QSslSocket>
#include <QTest>
#include <QTimer>

namespace {

const QString anna = "anna@orvala.example", ben = "ben@orvala.example";
const QString party = QString::fromUtf8("Party \U0001F389");
constexpr int seaPhotos = 10, forestPhotos = 7, partyPhotos = 5;
constexpr int photos = seaPhotos + forestPhotos + partyPhotos;

using Behaviour = MisbehavingServer::Behaviour;

// Hands the request on to the service, and its answer back until the service closes.
Behaviour forwardTo(quint16 port)
{
    return [port](QTcpSocket *client, const MisbehavingServer::Request &request) {
        auto *service = new QSslSocket(client);
        service->setPeerVerifyMode(QSslSocket::VerifyNone);
        QObject::connect(service, &QSslSocket::readyRead, client,
                         [=] { client->write(service->readAll()); });
        QObject::connect(service, &QSslSocket::disconnected, client,
                         [=] { client->disconnectFromHost(); });
        service->connectToHostEncrypted("127.0.0.1", port);
        QByteArray head = request.method + ' ' + request.path + " HTTP/1.1\r\n";
        for (auto it = request.headers.cbegin(); it != request.headers.cend(); ++it) {
            if (it.key() != "connection")
                head += it.key() + ": " + it.value() + "\r\n";
        }
        service->write(head + "connection: close\r\n\r\n" + request.body);
    };
}

} // namespace

// Somebody with the remote in front of the whole program and a real album service.
class TestEndToEnd : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void init();
    void cleanup();
    void browsesFromSignInToExit();
    void outlivesTheService();
    void staysUsableBehindABadRelay_data();
    void staysUsableBehindABadRelay();
    void showsWhichPicturesAreMissing();
    void showsWhatWasUploaded(); // last: there is one photo more then

private:
    void addPhotos(const QString &folder, const QString &name, int count);
    void signIn(const QString &origin);
    int seaAlbum() const; // its number

    AlbumService mService;
    QHash<QString, QColor> mColours; // by caption
    std::unique_ptr<Television> mTv;
};

void TestEndToEnd::addPhotos(const QString &folder, const QString &name, int count)
{
    for (int i = 1; i <= count; ++i) {
        const QString caption = name + ' ' + QString::number(i);
        const QColor colour = QColor::fromHsv(mColours.size() * 16, 255, 200);
        mColours.insert(caption, colour);
        QVERIFY(mService.addPhoto(folder + '/' + caption + ".jpg", colour, {400, 300}));
    }
}

void TestEndToEnd::initTestCase()
{
    initResources();
    addPhotos("anna/Sea", "Wave", seaPhotos);
    addPhotos("anna/Forest", "Tree", forestPhotos);
    addPhotos("ben/Party", party, partyPhotos);
    QVERIFY(mService.addFile("anna/Forest/broken.jpg", "\xff\xd8\xff this is no photo"));
    QVERIFY(mService.addUser(anna, "Anna", "anna"));
    QVERIFY(mService.addUser(ben, "Ben", "ben"));
}

void TestEndToEnd::init()
{
    QVERIFY(mService.start());
    QVERIFY(mService.waitForPhotos(photos));
    mTv = std::make_unique<Television>();
}

void TestEndToEnd::cleanup()
{
    mTv.reset();
    mService.kill();
}

void TestEndToEnd::signIn(const QString &origin)
{
    mTv->useService(origin);
    QVERIFY(mTv->addAccount(anna, "Anna", mService.tokens(anna)));
    QVERIFY(mTv->addAccount(ben, "Ben", mService.tokens(ben)));
    QVERIFY(mTv->switchOn());
    QVERIFY(mTv->accounts().contains(anna));
    if (mTv->focus() != anna)
        mTv->press(DEVICE_DOWN_KEY);
    QTRY_COMPARE(mTv->focus(), anna);
    mTv->press(DEVICE_SELECT_KEY);
    QTRY_COMPARE(mTv->captions().size(), 8);
    QTRY_VERIFY(mTv->showsColours(mColours));
    QCOMPARE(mTv->focus(), mTv->captions().first());
}

int TestEndToEnd::seaAlbum() const
{
    const QJsonDocument tokens = QJsonDocument::fromJson(mService.tokens(anna));
    const QByteArray feed =
        mService.get(mService.url() + "/data/feed/api/user/default?access_token=" +
                     tokens["access_token"].toString());
    const QJsonArray albums = QJsonDocument::fromJson(feed)["feed"]["entry"].toArray();
    for (const QJsonValue &album : albums) {
        if (album["title"]["$t"] == "Sea")
            return album["gphoto$id"]["$t"].toString().toInt();
    }
    return 0;
}

void TestEndToEnd::browsesFromSignInToExit()
{
    signIn(mService.url());
    if (QTest::currentTestFailed())
        return;
    const auto at = [](int number) { return QStringLiteral("%1/%2").arg(number).arg(photos); };

    // Through all featured photos to the last one, and back.
    QSet<QString> seen;
    for (int number = 1; number <= photos; ++number) {
        QTRY_COMPARE(mTv->position(), at(number));
        QTRY_VERIFY(mTv->showsColours(mColours));
        QVERIFY(mTv->captions().contains(mTv->focus()));
        seen.insert(mTv->focus());
        mTv->press(DEVICE_RIGHT_KEY);
    }
    QCOMPARE(seen.size(), photos);
    QVERIFY(seen.contains(party + " 1"));
    for (int number = photos; number > 1; --number) {
        QTRY_COMPARE(mTv->position(), at(number));
        mTv->press(DEVICE_LEFT_KEY);
    }
    QTRY_COMPARE(mTv->position(), at(1));

    // My Photos, the second album, its photos, and Return to the album.
    QVERIFY(mTv->enter(UpWidget::MyPhotosEntry));
    QTRY_COMPARE(mTv->captions().size(), 2);
    mTv->press({DEVICE_DOWN_KEY, DEVICE_RIGHT_KEY});
    QTRY_COMPARE(mTv->position(), QStringLiteral("2/2"));
    const QString album = mTv->focus();
    const int inAlbum = album.startsWith("Sea") ? seaPhotos : forestPhotos;
    QCOMPARE(album.section('\n', 1).section(' ', 0, 0).toInt(), inAlbum);
    mTv->press(DEVICE_SELECT_KEY);
    QTRY_COMPARE(mTv->captions().size(), qMin(inAlbum, 8));
    QTRY_VERIFY(mTv->showsColours(mColours));
    QTRY_COMPARE(mTv->position(), QStringLiteral("1/%1").arg(inAlbum));
    mTv->press(DEVICE_RETURN_KEY);
    QTRY_COMPARE(mTv->captions().size(), 2);
    QTRY_COMPARE(mTv->focus(), album);

    // Exit: the shell is asked, agrees, and hears that the program leaves.
    mTv->press(DEVICE_EXIT_KEY);
    const auto request = mTv->shell().next();
    QVERIFY(request && request->type == netcommon::MSG_REQUEST_EXIT);
    QVERIFY(mTv->shell().send(netcommon::MSG_EXIT, 1));
    QCOMPARE(QApplication::exec(), 0);
    const auto answer = mTv->shell().next();
    QVERIFY(answer && answer->type == netcommon::MSG_RESPONSE);
    QCOMPARE(answer->params[0], 2);
}

void TestEndToEnd::outlivesTheService()
{
    signIn(mService.url());
    if (QTest::currentTestFailed())
        return;
    mService.kill();
    QVERIFY(mTv->enter(UpWidget::MyPhotosEntry));
    QTRY_COMPARE(mTv->failure(), ScreenTexts::failure(ScreenTexts::NoConnection));
    mTv->press(DEVICE_DOWN_KEY);
    QTRY_COMPARE(mTv->focus(), QStringLiteral("FailurePage"));
    mTv->press(DEVICE_SELECT_KEY); // in vain
    QTRY_VERIFY(!mTv->isLoading());
    QVERIFY(!mTv->failure().isEmpty());
    QVERIFY(mService.start());
    mTv->press(DEVICE_SELECT_KEY);
    QTRY_COMPARE(mTv->captions().size(), 2);
    QVERIFY(mTv->failure().isEmpty());
}

void TestEndToEnd::staysUsableBehindABadRelay_data()
{
    QTest::addColumn<Behaviour>("behaviour");
    QTest::addColumn<int>("failure"); // -1: the answer is a list without records

    QTest::newRow("reset") << MisbehavingServer::reset() << int(ScreenTexts::PageFailed);
    QTest::newRow("cut body") << MisbehavingServer::cut("{\"feed\":{\"entry\":[{", 5000)
                              << int(ScreenTexts::PageFailed);
    QTest::newRow("HTML") << MisbehavingServer::html() << -1;
    QTest::newRow("401") << MisbehavingServer::answer("{}", 401) << int(ScreenTexts::PageRefused);
    QTest::newRow("500") << MisbehavingServer::answer("oops", 500) << int(ScreenTexts::PageFailed);
    QTest::newRow("silence") << MisbehavingServer::silence() << int(ScreenTexts::PageTooSlow);
}

void TestEndToEnd::staysUsableBehindABadRelay()
{
    QFETCH(Behaviour, behaviour);
    QFETCH(int, failure);
    MisbehavingServer relay(MisbehavingServer::Tls);
    relay.otherwise(forwardTo(mService.port()));
    mTv->set("Network/SilenceSeconds", 1);
    mTv->set("Max/PageCacheSeconds", 1);
    signIn(relay.url({}));
    if (QTest::currentTestFailed())
        return;

    const QByteArray albums = "/data/feed/api/user/default";
    relay.on(albums, behaviour);
    QVERIFY(mTv->enter(UpWidget::MyPhotosEntry));
    QTRY_VERIFY(!mTv->isLoading());
    QVERIFY(mTv->captions().isEmpty());
    QCOMPARE(mTv->failure(), failure < 0 ? QString() : ScreenTexts::failure(failure));

    if (failure == ScreenTexts::PageRefused)
        mTv->press({DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY}); // no, not to the accounts

    // The menu leads to what can be had, ...
    QVERIFY(mTv->enter(UpWidget::HomeEntry));
    QTRY_COMPARE(mTv->captions().size(), 8);
    QTRY_VERIFY(mTv->showsColours(mColours));
    // ... and to the albums when they can be had again. A list without records counts for a while.
    relay.on(albums, forwardTo(mService.port()));
    const auto albumsAreShown = [this] {
        if (!mTv->isLoading())
            mTv->enter(UpWidget::MyPhotosEntry);
        return mTv->captions().size() == 2;
    };
    QTRY_VERIFY(albumsAreShown());
}

void TestEndToEnd::showsWhichPicturesAreMissing()
{
    MisbehavingServer relay(MisbehavingServer::Tls);
    relay.otherwise(forwardTo(mService.port()));
    mTv->set("Network/SilenceSeconds", 1);
    signIn(relay.url({}));
    if (QTest::currentTestFailed())
        return;
    int broken = 5; // as many as are downloaded at once
    relay.otherwise([&](QTcpSocket *client, const MisbehavingServer::Request &request) {
        const Behaviour bad =
            broken % 2 ? MisbehavingServer::silence() : MisbehavingServer::reset();
        const bool isBad = request.path.startsWith("/photos/") && broken > 0;
        broken -= isBad;
        (isBad ? bad : forwardTo(mService.port()))(client, request);
    });
    mTv->press(DEVICE_PAGEDOWN_KEY);
    QTRY_COMPARE(mTv->position(), QStringLiteral("9/%1").arg(photos));
    QTRY_COMPARE(mTv->captions().size(), 8);
    QVERIFY(!mTv->showsColours(mColours));
    // The keys go on working.
    mTv->press({DEVICE_RIGHT_KEY, DEVICE_DOWN_KEY});
    QTRY_COMPARE(mTv->position(), QStringLiteral("14/%1").arg(photos));
    mTv->press({DEVICE_PAGEDOWN_KEY});
    QTRY_COMPARE(mTv->position(), QStringLiteral("17/%1").arg(photos));
    QTRY_VERIFY(mTv->showsColours(mColours));
}

void TestEndToEnd::showsWhatWasUploaded()
{
    signIn(mService.url());
    if (QTest::currentTestFailed())
        return;
    const QString file = QDir(QDir::tempPath()).filePath("orvala-upload.png");
    QImage picture(400, 300, QImage::Format_RGB32);
    picture.fill(Qt::magenta);
    QVERIFY(picture.save(file));
    const QString title = QString::fromUtf8("<b> & \"\u044f\U0001F41F\" %1");
    mColours.insert(title, Qt::magenta);
    const QString album = QString::number(seaAlbum());
    QCOMPARE(MediaUploader::startToUpload(file, title, "default", album, "", false), NET_SUCCESS);
    QVERIFY(QFile::remove(file));

    QVERIFY(mTv->enter(UpWidget::MyPhotosEntry));
    QTRY_COMPARE(mTv->captions().size(), 2);
    if (!mTv->focus().startsWith("Sea"))
        mTv->press({DEVICE_DOWN_KEY, DEVICE_RIGHT_KEY});
    QTRY_VERIFY(mTv->focus().startsWith("Sea\n11 "));
    mTv->press(DEVICE_SELECT_KEY);
    QTRY_COMPARE(mTv->position(), QStringLiteral("1/11"));
    mTv->press(DEVICE_PAGEDOWN_KEY);
    QTRY_VERIFY(mTv->captions().contains(title));
    QTRY_VERIFY(mTv->showsColours(mColours));
}

int main(int argc, char *argv[])
{
    MainApplication application(argc, argv);
    TestEndToEnd test;
    return QTest::qExec(&test, argc, argv);
}
#include "tst_endtoend.moc"
