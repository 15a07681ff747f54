#include "accountmanager/accountmanagerhelper.h"
#include "base/i18n.h"
#include "common/ui/qconfirm.h"
#include "common/ui/qpopupdialog.h"
#include "common/ui/qpopupform.h"
#include "common/ui/qtoastwidget.h"
#include "ui/notelist.h"
#include "ui/photopopups.h"
#include "ui/picturedetailwidget.h"
#include "ui/screencase.h"
#include "ui/screentexts.h"
#include "ui/sendingnotice.h"

namespace {

const QByteArray kPhoto = "/data/feed/api/user/me/albumid/a1/photoid/7";
const QByteArray kEntry = "/data/entry/api/user/me/albumid/a1/photoid/7";

QJsonObject photo()
{
    QJsonObject entry = sample::photo("Sea");
    entry.insert("gphoto$id", sample::text("7"));
    entry.insert("gphoto$albumid", sample::text("a1"));
    entry.insert("author", QJsonArray{QJsonObject{{"gphoto$user", sample::text("me")}}});
    return entry;
}

QJsonObject comment(const QString &id, const QString &author, const QString &text)
{
    return {{"gphoto$id", sample::text(id)},
            {"content", sample::text(text)},
            {"published", sample::text("2024-05-0" + id + "T10:00:00.000Z")},
            {"author", QJsonArray{QJsonObject{{"gphoto$user", sample::text(author)},
                                              {"gphoto$nickname", sample::text(author)}}}}};
}

QByteArray tags(const QStringList &names)
{
    QJsonArray entries;
    for (const QString &name : names)
        entries << QJsonObject{{"title", sample::text(name)}};
    return sample::feed(entries, names.size());
}

} // namespace

// What pops up over the photo screen, by key presses, against a server of its own. The server keys
// its answers by path: the lists of comments and of tags come in turn.
class TestPopups : public ScreenCase
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void listsComments();
    void deletesAComment_data();
    void deletesAComment();
    void deletesATag();
    void tagsOfOthersAreOnlyShown();
    void postsAComment();
    void sendingCanBeGivenUp();

private:
    void open(bool isSelfPhoto = true);
    void answerNotes(const MisbehavingServer::Behaviour &behaviour);
    template <typename Type>
    Type *shown() const
    {
        for (Type *widget : mScreen->findChildren<Type *>()) {
            if (widget->isVisible())
                return widget;
        }
        return nullptr;
    }
    int count(const QByteArray &method) const;
    QString toast() const { return mScreen->findChild<QToastWidget *>()->text().simplified(); }

    std::unique_ptr<QWidget> mScreen;
    PictureDetailWidget *mDetail = nullptr;
};

void TestPopups::init()
{
    startServer();
    configure();
    AccountManagerHelper::setUserName("Me");
}

void TestPopups::cleanup()
{
    mScreen.reset();
    forgetAll();
}

void TestPopups::open(bool isSelfPhoto)
{
    mServer->on("/data/feed/api/user/me/albumid/a1",
                MisbehavingServer::answer(sample::feed({photo()}, 1, "me")));
    PackageProperty album;
    album.mType = ALBUM_PHOTOS_LIST;
    album.mUserId = "me";
    album.mAlbumId = "a1";
    QVERIFY(PackageManager::downloadPage(album, nullptr));
    QTRY_VERIFY(PackageManager::getPackage(album));
    mScreen = std::make_unique<QWidget>();
    mDetail = new PictureDetailWidget(mScreen.get());
    mDetail->resize(1150, 500);
    new PhotoPopups(mDetail, mScreen.get());
    mDetail->showPhoto(0, PackageManager::getPackage(album), isSelfPhoto, true);
    show(mScreen.get());
    mDetail->setFocus();
    QTRY_VERIFY(count("GET") >= 1);
}

void TestPopups::answerNotes(const MisbehavingServer::Behaviour &behaviour)
{
    mServer->on(kPhoto, behaviour);
}

int TestPopups::count(const QByteArray &method) const
{
    const auto requests = mServer->requests();
    return int(std::count_if(requests.begin(), requests.end(),
                             [&](const auto &request) { return request.method == method; }));
}

void TestPopups::listsComments()
{
    const QString hostile = QString("<table>").repeated(3000);
    answerNotes(MisbehavingServer::answer(
        sample::feed({comment("1", "Ann", "Old &amp; gold"), comment("2", "Me", hostile)}, 2)));
    open();
    emit mDetail->showMoreCommentSignal();
    QVERIFY(shown<NoteList>());
    QTRY_COMPARE(shown<NoteList>()->count(), 2);
    press({DEVICE_UP_KEY, DEVICE_DOWN_KEY, DEVICE_DOWN_KEY, DEVICE_DOWN_KEY});
    QCOMPARE(shown<NoteList>()->currentRow(), 2);
    press({DEVICE_SELECT_KEY}); // Ann's: not ours to delete
    QVERIFY(!shown<QPopupDialog>());
    press({DEVICE_RETURN_KEY});
    QVERIFY(!shown<NoteList>());
    QVERIFY(mDetail->hasFocus());
}

void TestPopups::deletesAComment_data()
{
    QTest::addColumn<bool>("isTaken");
    QTest::newRow("taken") << true;
    QTest::newRow("refused without a word") << false;
}

void TestPopups::deletesAComment()
{
    QFETCH(bool, isTaken);
    const QByteArray before = sample::feed({comment("2", "Me", "Mine")}, 1);
    answerNotes(MisbehavingServer::answer(before));
    open();
    emit mDetail->showMoreCommentSignal();
    QTRY_COMPARE(shown<NoteList>()->count(), 1);
    if (isTaken)
        answerNotes(MisbehavingServer::answer(sample::feed({}, 0)));
    press({DEVICE_DOWN_KEY, DEVICE_SELECT_KEY});
    QVERIFY(shown<QPopupDialog>());
    press({DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY}); // No
    QCOMPARE(count("DELETE"), 0);
    press({DEVICE_SELECT_KEY, DEVICE_SELECT_KEY}); // Yes
    QCOMPARE(count("DELETE"), 1);
    QTRY_COMPARE(toast(), ScreenTexts::question(isTaken ? ScreenTexts::CommentDeleted
                                                        : ScreenTexts::CommentNotDeleted));
    QCOMPARE(shown<NoteList>()->count(), isTaken ? 0 : 1);
    QVERIFY(shown<NoteList>()->hasFocus());
}

void TestPopups::deletesATag()
{
    answerNotes(MisbehavingServer::answer(tags({"sea", "a/b"})));
    mServer->on(kEntry + "/tag/a%2Fb", MisbehavingServer::answer(""));
    open();
    emit mDetail->showTagSignal();
    QTRY_COMPARE(shown<NoteList>()->count(), 2);
    press({DEVICE_DOWN_KEY, DEVICE_SELECT_KEY});
    QVERIFY(shown<QConfirm>());
    press({DEVICE_SELECT_KEY}); // the server does not know this one
    QTRY_COMPARE(toast(), I18n::prompt(8));
    answerNotes(MisbehavingServer::answer(tags({"sea"})));
    press({DEVICE_DOWN_KEY, DEVICE_SELECT_KEY, DEVICE_SELECT_KEY});
    QTRY_COMPARE(toast(), I18n::prompt(9));
    QTRY_COMPARE(shown<NoteList>()->count(), 1);
}

void TestPopups::tagsOfOthersAreOnlyShown()
{
    answerNotes(MisbehavingServer::answer(tags({})));
    open(false);
    emit mDetail->showTagSignal();
    QTRY_COMPARE(shown<NoteList>()->message(), I18n::label(15));
    press({DEVICE_DOWN_KEY, DEVICE_SELECT_KEY, DEVICE_RETURN_KEY});
    QVERIFY(!shown<QPopUpForm>());
    emit mDetail->addTagSignal();
    QVERIFY(!shown<QPopUpForm>());
}

void TestPopups::postsAComment()
{
    answerNotes(MisbehavingServer::answer(sample::feed({}, 0)));
    open(false);
    emit mDetail->showMoreCommentSignal();
    QTRY_VERIFY(!shown<NoteList>()->message().isEmpty());
    press({DEVICE_SELECT_KEY}); // + New Comment
    const QPointer<QPopUpForm> keyboard = mScreen->findChildren<QPopUpForm *>().last();
    keyboard->handleInput(" \n ");
    QCOMPARE(toast(), I18n::prompt(4));
    const QByteArray after = sample::feed({comment("3", "Me", "Nice")}, 1);
    answerNotes([after](QTcpSocket *socket, const MisbehavingServer::Request &request) {
        const QByteArray answer = request.method == "POST" ? R"({"entry":{}})" : after;
        MisbehavingServer::answer(answer)(socket, request);
    });
    keyboard->handleInput("Nice");
    QCOMPARE(toast(), I18n::prompt(7));
    QTRY_VERIFY(!keyboard);
    QTRY_COMPARE(shown<NoteList>()->count(), 1);
    QVERIFY(!shown<SendingNotice>());
}

void TestPopups::sendingCanBeGivenUp()
{
    answerNotes(MisbehavingServer::silence());
    open();
    emit mDetail->addTagSignal();
    QTimer poll;
    connect(&poll, &QTimer::timeout, this, [this] {
        if (count("POST") > 0)
            press({DEVICE_SELECT_KEY, DEVICE_RETURN_KEY});
    });
    poll.start(1);
    shown<QPopUpForm>()->handleInput("Nice");
    poll.stop();
    QVERIFY(!shown<SendingNotice>());
    QVERIFY(shown<QPopUpForm>());
}

QTEST_MAIN(TestPopups)
#include "tst_popups.moc"
