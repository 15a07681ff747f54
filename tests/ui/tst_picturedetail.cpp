#include "accountmanager/accountmanagerhelper.h"
#include "common/ui/qpopupdialog.h"
#include "data/download.h"
#include "ui/detailinformation.h"
#include "ui/detailpictures.h"
#include "ui/detailstage.h"
#include "ui/detailstrip.h"
#include "ui/detailtexts.h"
#include "ui/notelist.h"
#include "ui/photopopups.h"
#include "ui/picturedetailwidget.h"
#include "ui/screencase.h"
#include "ui/zoomview.h"

namespace {

constexpr const char *kFeatured = "/data/feed/api/featured";
constexpr const char *kAlbum = "/data/feed/api/user/anna/albumid/a1";

} // namespace

class TestPictureDetail : public ScreenCase
{
    Q_OBJECT

private slots:
    void init()
    {
        startServer();
        configure();
        for (int i = 1; i <= 20; ++i) {
            const QByteArray number = QByteArray::number(i);
            mServer->on("/small" + number, MisbehavingServer::answer(mSmallPicture));
            mServer->on("/p/s1180/" + number, MisbehavingServer::answer(mLargePicture));
        }
        mServer->on(kAlbum, MisbehavingServer::answer(records(1, 12)));
        mDetail = std::make_unique<PictureDetailWidget>();
        mDetail->resize(1152, 520);
        mDetail->show();
        mDetail->activateWindow();
        mDetail->setFocus();
        mSettled = std::make_unique<QSignalSpy>(mDetail->findChild<DetailPictures *>(),
                                                &DetailPictures::settled);
    }

    void cleanup()
    {
        mSettled.reset();
        mDetail.reset();
        forgetAll();
        QVERIFY(Download::mDetailLabelUrlHash.isEmpty());
        QVERIFY(Download::mDetailSmallLabelUrlHash.isEmpty());
    }

    void thumbnailComesFirst()
    {
        HeldAnswers held;
        mServer->on("/p/s1180/1", held.hold());
        open(ALBUM_PHOTOS_LIST, 0);
        auto *strip = mDetail->findChild<DetailStrip *>();
        QTRY_COMPARE(strip->pictureCount(), strip->places());
        QTRY_COMPARE(held.count(), 1);
        QVERIFY(stage()->isWaiting());
        QVERIFY(stage()->picture().isNull());
        // In the place of the photo, which is as high as the stage.
        const QImage shown = stage()->grab().toImage();
        QCOMPARE(shown.pixelColor(stage()->width() / 2, 20), QColor(Qt::red));

        held.answerFirst(MisbehavingServer::answer(mLargePicture));
        QTRY_VERIFY(!stage()->isWaiting());
        QCOMPARE(stage()->picture().height(), stage()->imageSize().height());
        // The next one is there before it is asked for.
        QTRY_VERIFY(PhotoManager::getPhoto(mServer->url("/p/s1180/2")));
        press(DEVICE_RIGHT_KEY);
        QVERIFY(!stage()->isWaiting());
        QVERIFY(information().contains("Photo 2"));
        QVERIFY(information().contains("2/12"));
    }

    void keys()
    {
        open(ALBUM_PHOTOS_LIST, 9);
        QSignalSpy show(mDetail.get(), &PictureDetailWidget::slideShow);
        QSignalSpy play(mDetail.get(), &PictureDetailWidget::slidePlay);
        QSignalSpy back(mDetail.get(), &PictureDetailWidget::backSignal);
        const QList<QPair<int, int>> moves{
            {DEVICE_NEXT_KEY, 11},  {DEVICE_RIGHT_KEY, 12},    {DEVICE_RIGHT_KEY, 12},
            {DEVICE_PAGEUP_KEY, 4}, {DEVICE_PAGEDOWN_KEY, 12}, {DEVICE_PAGEUP_KEY, 4},
            {DEVICE_PAGEUP_KEY, 1}, {DEVICE_LEFT_KEY, 1},      {DEVICE_NEXT_KEY, 2}};
        for (const auto &move : moves) {
            press(move.first);
            QCOMPARE(mDetail->number(), move.second);
        }
        for (int key :
             {DEVICE_SELECT_KEY, DEVICE_PLAY_KEY, DEVICE_PLAYPAUSE_KEY, DEVICE_RETURN_KEY})
            press(key);
        QCOMPARE(show.value(0).value(0).toInt(), 1);
        QCOMPARE(play.count(), 2);
        QCOMPARE(back.value(0).value(0).toInt(), 1);
        for (int key : {int(DEVICE_UP_KEY), int(DEVICE_RED_KEY), int(Qt::Key_A)}) {
            QKeyEvent event(QEvent::KeyPress, key, Qt::NoModifier);
            QCoreApplication::sendEvent(mDetail.get(), &event);
            QVERIFY(!event.isAccepted()); // the owner's
        }
    }

    void theFeedEndsEarly()
    {
        serveFeatured(11, 100);
        open(FEATURED_PHOTOS_LIST, 7);
        for (int number : {9, 10, 11, 11}) {
            press(DEVICE_RIGHT_KEY);
            QTRY_COMPARE(mDetail->number(), number);
        }
        QTRY_VERIFY(information().contains("11/11"));
        const int asked = requestsFor(kFeatured);
        press(DEVICE_RIGHT_KEY);
        QCOMPARE(requestsFor(kFeatured), asked);
    }

    void aPageFails()
    {
        serveFeatured(20, 20);
        open(FEATURED_PHOTOS_LIST, 7);
        mServer->on(kFeatured, MisbehavingServer::reset());
        PackageManager::clearAll(); // the page fetched ahead among them
        press(DEVICE_RIGHT_KEY);
        QTRY_COMPARE(stage()->message(), DetailTexts::text(DetailTexts::PageFailed));
        QCOMPARE(mDetail->number(), 8);
        QCOMPARE(mDetail->photo().title, QString("Photo 8"));
        serveFeatured(20, 20);
        press(DEVICE_RIGHT_KEY);
        QTRY_COMPARE(mDetail->photo().title, QString("Photo 9"));
        QVERIFY(stage()->message().isEmpty());
    }

    void theListIsLost()
    {
        open(ALBUM_PHOTOS_LIST, 4);
        PackageManager::removeCache(mList);
        press(DEVICE_RIGHT_KEY);
        QCOMPARE(mDetail->photo().title, QString("Photo 5")); // until the list is there again
        press(DEVICE_RIGHT_KEY);
        QTRY_COMPARE(mDetail->photo().title, QString("Photo 6"));
        QCOMPARE(requestsFor(QByteArray(kAlbum) + "?"), 2);
        mDetail->showPhoto(3, nullptr, false, true);
        QTRY_COMPARE(stage()->message(), DetailTexts::text(DetailTexts::PageFailed));
        press(DEVICE_SELECT_KEY);
    }

    void aPhotoIsDeleted()
    {
        open(ALBUM_PHOTOS_LIST, 4);
        PackageManager::removeCache(mList);
        mServer->on(kAlbum, MisbehavingServer::answer(records(4, 12)));
        press(DEVICE_RIGHT_KEY);
        QTRY_COMPARE(mDetail->photo().title, QString("Photo 6"));
        QCOMPARE(mDetail->number(), 3);

        PackageManager::removeCache(mList);
        mServer->on(kAlbum, MisbehavingServer::answer(sample::feed({}, 0)));
        press(DEVICE_RIGHT_KEY);
        QTRY_COMPARE(requestsFor(QByteArray(kAlbum) + "?"), 3);
        QTRY_COMPARE(mDetail->total(), 0);
        press(DEVICE_LEFT_KEY);
        QCOMPARE(mDetail->photo().title, QString("Photo 6"));
    }

    void staleLargePictures()
    {
        HeldAnswers first;
        mServer->on("/p/s1180/1", first.hold());
        mServer->on("/p/s1180/2", MisbehavingServer::answer(encoded(plain(300, 600), "PNG")));
        open(ALBUM_PHOTOS_LIST, 0);
        QTRY_COMPARE(first.count(), 1);
        press(DEVICE_RIGHT_KEY);
        QTRY_VERIFY(!stage()->isWaiting());
        first.answerFirst(MisbehavingServer::answer(mLargePicture));
        QTRY_VERIFY(PhotoManager::getPhoto(mServer->url("/p/s1180/1")));
        QVERIFY(stage()->picture().width() < stage()->picture().height());
    }

    void aPictureIsLargerThanTheCache()
    {
        mConfig.write("[Max]\nCacheSize=5\n[Service]\nFeedBase=" + mServer->url("").toUtf8());
        PhotoManager::init();
        mServer->on("/p/s1180/1", MisbehavingServer::answer(encoded(plain(1200, 1200), "PNG")));
        open(ALBUM_PHOTOS_LIST, 0);
        QTRY_COMPARE(stage()->message(), DetailTexts::text(DetailTexts::PhotoFailed));
        QVERIFY(!stage()->isWaiting());
        openZoom(); // nothing to magnify
        QVERIFY(!mDetail->findChild<ZoomView *>()->isVisible());
        press(DEVICE_NEXT_KEY);
        QTRY_VERIFY(!stage()->isWaiting());
        QVERIFY(stage()->message().isEmpty());
    }

    void rushingAsksForFew()
    {
        open(ALBUM_PHOTOS_LIST, 0);
        for (int i = 0; i < 11; ++i)
            press(DEVICE_RIGHT_KEY);
        stayHere();
        QTRY_VERIFY(!stage()->isWaiting());
        QCOMPARE(mDetail->number(), 12);
        QCOMPARE(requestsFor("/p/"), 2); // the first and the last
        QTRY_COMPARE(requestsFor(QByteArray(kAlbum) + "/photoid"), 2);
    }

    // In the list, newest first, whoever wrote them; only the reader's own can be deleted.
    void commentsOfOthers()
    {
        const auto comment = [](const QString &name, const QString &text, const QString &time) {
            const QJsonObject author{{"gphoto$user", sample::text(name)},
                                     {"gphoto$nickname", sample::text(name)}};
            return QJsonObject{{"gphoto$id", sample::text(time)},
                               {"author", QJsonArray{author}},
                               {"content", sample::text(text)},
                               {"published", sample::text(time)}};
        };
        const QJsonArray comments{comment("Ben", "<b>older</b>", "2025-06-16T07:45:00Z"),
                                  comment("Eve", "newer &amp;lt; all", "2025-06-17T07:45:00Z"),
                                  comment("Eve", QString("<table>").repeated(3000), "1990")};
        mServer->on(QByteArray(kAlbum) + "/photoid/1",
                    MisbehavingServer::answer(sample::feed(comments, 0)));
        AccountManagerHelper::setUserName("Ben");
        new PhotoPopups(mDetail.get(), mDetail.get());
        open(ALBUM_PHOTOS_LIST, 0, true);
        QTRY_VERIFY(information().contains("Comments: 3"));
        const QString text = information();
        QVERIFY(text.contains("<b>older</b>"));
        QVERIFY(text.indexOf("newer < all") < text.indexOf("older"));

        emit mDetail->showMoreCommentSignal();
        auto *list = mDetail->findChild<NoteList *>();
        QTRY_COMPARE(list->count(), 3);
        for (bool isOwn : {false, true}) {
            for (int key : {DEVICE_DOWN_KEY, DEVICE_SELECT_KEY})
                QTest::sendKeyEvent(QTest::Press, list, Qt::Key(key), "", {});
            QCOMPARE(mDetail->findChild<QPopupDialog *>() != nullptr, isOwn);
        }
    }

    void notesOfAnotherPhoto()
    {
        HeldAnswers held;
        mServer->on(QByteArray(kAlbum) + "/photoid/1", held.hold());
        open(ALBUM_PHOTOS_LIST, 0);
        QTRY_COMPARE(held.count(), 2);
        press(DEVICE_RIGHT_KEY);
        const QJsonArray late{sample::photo("late tag")};
        while (held.count() > 0)
            held.answerFirst(MisbehavingServer::answer(sample::feed(late, 0)));
        // Comments that the service does not give.
        QTRY_VERIFY(information().contains(DetailTexts::text(DetailTexts::PhotoGone)));
        PackageProperty first = mDetail->photo().request(PHOTO_TAGS_LIST);
        first.mPhotoId = "1";
        QTRY_VERIFY(PackageManager::getPackage(first));
        QVERIFY(!information().contains("late tag"));
    }

    void oddTexts()
    {
        const QStringList titles{
            QString("word ").repeated(2000), QString("x").repeated(10000),
            QString::fromUtf8("👨‍👩‍👧‍👦🏔️שלום").repeated(500),
            "&lt;table&gt;%1 %2", ""};
        QJsonArray entries{QJsonObject()};
        for (const QString &title : titles) {
            QJsonObject entry = record(entries.size());
            entry["title"] = entry["summary"] = sample::text(title);
            entries << entry;
        }
        mServer->on(kAlbum, MisbehavingServer::answer(sample::feed(entries, 0, "anna")));
        open(ALBUM_PHOTOS_LIST, 0); // an empty record
        QTRY_COMPARE(stage()->message(), DetailTexts::text(DetailTexts::PhotoFailed));
        for (int i = 0; i < titles.size(); ++i) {
            press(DEVICE_RIGHT_KEY);
            const QStringList shown = mDetail->findChild<DetailInformation *>()->texts();
            QVERIFY(shown.size() >= 5);
            QVERIFY(shown.first().size() < 200);
            mDetail->grab();
        }
        QCOMPARE(shownTitle(), DetailTexts::text(DetailTexts::Untitled));
        press(DEVICE_LEFT_KEY);
        QCOMPARE(shownTitle(), QString("<table>%1 %2"));
        for (const QSize &size : {QSize(200, 100), QSize(1, 1)}) {
            mDetail->resize(size);
            mDetail->grab();
        }
    }

    void zoomByKeys()
    {
        open(ALBUM_PHOTOS_LIST, 1);
        QTRY_VERIFY(!stage()->isWaiting());
        auto *zoom = mDetail->findChild<ZoomView *>();
        HeldAnswers sharper;
        const int width = 520 * 4 / 3 * 4;
        QVERIFY(width < 4000);
        for (int delta : {0, 1, 2, 3}) // where rounding leads
            mServer->on("/p/s" + QByteArray::number(width + delta) + "/2", sharper.hold());
        openZoom();
        QVERIFY(zoom->isVisible());
        QTRY_COMPARE(sharper.count(), 1);
        sharper.answerFirst(MisbehavingServer::answer(encoded(plain(2000, 1500), "PNG")));
        QTRY_VERIFY(Download::mDetailLabelUrlHash.isEmpty());

        QCOMPARE(zoom->factor(), 2.0);
        const QList<QPair<int, qreal>> steps{{DEVICE_SELECT_KEY, 4},   {DEVICE_PAGEUP_KEY, 4},
                                             {DEVICE_PAGEDOWN_KEY, 2}, {DEVICE_PAGEUP_KEY, 4},
                                             {DEVICE_SELECT_KEY, 2},   {DEVICE_RIGHT_KEY, 2}};
        for (const auto &step : steps) {
            press(step.first);
            QCOMPARE(zoom->factor(), step.second);
            QCOMPARE(mDetail->number(), 2);
        }
        QCOMPARE(zoom->grab().toImage().pixelColor(100, 100), QColor(Qt::red));
        QSignalSpy back(mDetail.get(), &PictureDetailWidget::backSignal);
        for (int leaves : {0, 1}) {
            press(DEVICE_RETURN_KEY);
            QVERIFY(!zoom->isVisible());
            QCOMPARE(back.count(), leaves);
        }
    }

private:
    void press(int key) { QTest::sendKeyEvent(QTest::Press, mDetail.get(), Qt::Key(key), "", {}); }

    // Opens a list as the home screen does.
    void open(int type, int index, bool isSelf = false)
    {
        mList = PackageProperty();
        mList.mType = type;
        mList.mUserId = "anna";
        mList.mAlbumId = "a1";
        mList.mSearchedStr = "tree";
        mArrived = 0;
        QVERIFY(
            PackageManager::downloadPage(mList, [](PackageProperty &, ErrorCode) { ++mArrived; }));
        QTRY_COMPARE(mArrived, 1);
        mDetail->showPhoto(index, PackageManager::getPackage(mList), isSelf, true);
        QCOMPARE(mDetail->number(), index + 1);
    }

    void openZoom()
    {
        for (int key : {DEVICE_DOWN_KEY, DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY})
            press(key);
    }

    void stayHere() { QTRY_COMPARE(mSettled->count(), 1); }

    QJsonObject record(int number) const
    {
        const QString name = QString::number(number);
        QJsonObject entry = sample::photo("Photo " + name, mServer->url("/small" + name));
        entry["content"] = QJsonObject{{"src", mServer->url("/p/" + name)}};
        entry["gphoto$id"] = sample::text(name);
        entry["gphoto$albumid"] = sample::text("a1");
        entry["gphoto$width"] = sample::text(4000);
        entry["gphoto$height"] = sample::text(3000);
        entry["author"] = QJsonArray{QJsonObject{{"gphoto$user", sample::text("anna")},
                                                 {"gphoto$nickname", sample::text("A")}}};
        return entry;
    }

    QByteArray records(int first, int last) const
    {
        QJsonArray entries;
        for (int i = first; i <= last; ++i)
            entries << record(i);
        return sample::feed(entries, 0, "anna");
    }

    // Featured photos, of which the service has less than it says.
    void serveFeatured(int last, int total)
    {
        mServer->on(kFeatured, pages(last, total, [this](int number) { return record(number); }));
    }

    DetailStage *stage() { return mDetail->findChild<DetailStage *>(); }

    // All texts, without the breaks of their lines.
    QString information()
    {
        return mDetail->findChild<DetailInformation *>()->texts().join(' ').simplified();
    }

    QString shownTitle() { return mDetail->findChild<DetailInformation *>()->texts().first(); }

    std::unique_ptr<PictureDetailWidget> mDetail;
    std::unique_ptr<QSignalSpy> mSettled;
    PackageProperty mList;
    const QByteArray mSmallPicture = encoded(plain(80, 60), "PNG");
    const QByteArray mLargePicture = encoded(plain(1180, 885), "JPG");
    static int mArrived;
};

int TestPictureDetail::mArrived = 0;

QTEST_MAIN(TestPictureDetail)
#include "tst_picturedetail.moc"
