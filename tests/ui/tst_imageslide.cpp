#include "data/download.h"
#include "platform/devicestate.h"
#include "ui/formscrollarea.h"
#include "ui/formscrollwidget.h"
#include "ui/homewidget.h"
#include "ui/qimageslide.h"
#include "ui/screencase.h"
#include "ui/slidemarks.h"
#include "ui/slidephotos.h"
#include "ui/slidesetting.h"
#include "ui/widget.h"

#include <QTcpSocket>

namespace {

const char *const kFeatured = "/data/feed/api/featured";
const QString kLoading = QStringLiteral(":/res/image_is_loading.png");
const QString kFailed = QStringLiteral(":/res/image_download_failed.png");
const QVariantList kStarted{2, 0, 0, 0};
const QVariantList kStopped{2, 2, 0, 0};

QByteArray pathOf(int number)
{
    return "/s0/p" + QByteArray::number(number) + ".png";
}

} // namespace

// The player by key presses, with the home screen and a server of its own. A turn's end is the
// timer's slot being called.
class TestImageSlide : public ScreenCase
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void aPlayEndsAtTheLastPhoto();
    void keysStepAndPause();
    void theNextPageJoins();
    void theLastPagesJoinIfWanted();
    void returnSelectsTheRecord();
    void aPhotoIsThereBeforeItsTurn();
    void thumbnailsStandIn();
    void failingPhotosDoNotStopThePlay();
    void photosThatNeverComeBlockNobody();
    void aTurnWaitsForItsPhoto();
    void allUnreadableCanBeLeft();
    void roundsFollowEachOther();
    void keysDuringADownload_data();
    void keysDuringADownload();
    void aShorterListEndsThePlay();
    void settingsAreKept();
    void aCancelledSettingChangesNothing();
    void thePlatformHearsTheEnd();

private:
    void serve(int total);
    void answerPhotos(int first, int last, const MisbehavingServer::Behaviour &behaviour);
    void open(const QByteArray &slideShow = QByteArray());
    void play(int index) { emit mPage->homeScreen()->slidePlay(index); }
    void show(int index) { emit mPage->homeScreen()->slideShow(index); }
    QImageSlide *player() const { return mPage->player(); }
    SlideLabel *label() const { return player()->label(); }
    SlideMarks *marks() const { return player()->findChild<SlideMarks *>(); }
    int requestsOf(int number) const;
    bool showsPhoto() const { return label()->placeholder().isEmpty(); }

    std::unique_ptr<Widget> mPage;
    std::unique_ptr<QSignalSpy> mReports;
};

void TestImageSlide::init()
{
    NetworkCableStatus = true;
    SlideSetting::SlideMode = 0;
    SlideSetting::SlideSpeed = 3600; // no turn ends by itself
    startServer();
}

void TestImageSlide::cleanup()
{
    mPage.reset();
    forgetAll();
}

// Featured photos 1 to total, as many a page as asked for; their thumbnails do not exist.
void TestImageSlide::serve(int total)
{
    mServer->on(kFeatured, [this, total](QTcpSocket *socket, const MisbehavingServer::Request &r) {
        const int at = r.path.indexOf("start-index=") + 12;
        const int first = r.path.mid(at, r.path.indexOf('&', at) - at).toInt();
        QJsonArray photos;
        for (int i = first; i <= qMin(first + 7, total); ++i)
            photos << sample::photo("Photo", mServer->url(QString("/p%1.png").arg(i)));
        MisbehavingServer::answer(sample::feed(photos, total))(socket, r);
    });
    answerPhotos(1, total, MisbehavingServer::answer(encoded(plain(32, 18), "PNG")));
}

void TestImageSlide::answerPhotos(int first, int last,
                                  const MisbehavingServer::Behaviour &behaviour)
{
    for (int i = first; i <= last; ++i)
        mServer->on(pathOf(i), behaviour);
}

void TestImageSlide::open(const QByteArray &slideShow)
{
    configure("[SlideShow]\n" + slideShow);
    mPage.reset(); // one at a time
    mPage = std::make_unique<Widget>();
    ScreenCase::show(mPage.get());
    QTRY_VERIFY(!mPage->homeScreen()->isLoading());
    mReports = std::make_unique<QSignalSpy>(player(), &QImageSlide::signalUpdatePlaybackinfo);
}

int TestImageSlide::requestsOf(int number) const
{
    const auto &all = mServer->requests();
    return std::count_if(all.begin(), all.end(),
                         [&](const auto &request) { return request.path == pathOf(number); });
}

void TestImageSlide::aPlayEndsAtTheLastPhoto()
{
    serve(3);
    open();
    press({DEVICE_RIGHT_KEY, DEVICE_PLAY_KEY});
    QVERIFY(QImageSlide::mIsShowing && player()->isVisible() && player()->hasFocus());
    QVERIFY(marks()->isPlayShown() && !marks()->isPauseShown());
    QCOMPARE(player()->position(), 1);
    QCOMPARE(player()->interval(), 3600000);
    QCOMPARE(mReports->takeFirst(), kStarted);
    player()->update();
    QCOMPARE(player()->position(), 2);
    QVERIFY(marks()->isLeftShown() && !marks()->isRightShown());
    QVERIFY(player()->isVisible());
    player()->update();
    QVERIFY(!QImageSlide::mIsShowing && !player()->isVisible());
    QVERIFY(mPage->homeScreen()->isVisible());
    QCOMPARE(mReports->takeFirst(), kStopped);
    QTRY_VERIFY(!mPage->homeScreen()->isLoading());
    auto *cells = mPage->findChild<FormScrollArea *>()->content();
    QVERIFY(cells->cell(2)->hasFocus());
}

void TestImageSlide::keysStepAndPause()
{
    serve(3);
    open();
    show(0);
    QVERIFY(mReports->isEmpty() && marks()->isPauseShown() && !marks()->isLeftShown());
    press({DEVICE_LEFT_KEY});
    QCOMPARE(player()->position(), 0);
    press({DEVICE_RIGHT_KEY, DEVICE_NEXT_KEY, DEVICE_RIGHT_KEY, DEVICE_NEXT_KEY});
    QCOMPARE(player()->position(), 2);
    press({DEVICE_PRE_KEY});
    QCOMPARE(player()->position(), 1);
    player()->update(); // not playing: it stays
    QCOMPARE(player()->position(), 1);

    press({DEVICE_PLAYPAUSE_KEY});
    QVERIFY(player()->isPlaying());
    press({DEVICE_PLAYPAUSE_KEY, DEVICE_PLAY_KEY, DEVICE_SELECT_KEY, DEVICE_PAUSE_KEY});
    QVERIFY(!player()->isPlaying());
    const QList<QVariantList> reports{kStarted, kStopped, kStarted, kStopped, kStopped};
    QCOMPARE(static_cast<QList<QVariantList>>(*mReports), reports);
    press({DEVICE_RED_KEY, DEVICE_UP_KEY, DEVICE_PAGEDOWN_KEY});
    QVERIFY(player()->hasFocus());
    QCOMPARE(player()->position(), 1);
}

void TestImageSlide::theNextPageJoins()
{
    serve(40);
    open();
    QTRY_COMPARE(HomeWidget::mCurrentPackageData->count(), 16); // the second page comes by itself
    QSignalSpy wanted(player(), &QImageSlide::handleSlidePageDown);
    show(0);
    QCOMPARE(player()->playArray().size(), 16);
    for (int i = 0; i < 7; ++i)
        press({DEVICE_RIGHT_KEY});
    QVERIFY(wanted.isEmpty());
    press({DEVICE_RIGHT_KEY});
    QCOMPARE(wanted.value(0), QVariantList({9}));
    QTRY_COMPARE(HomeWidget::mCurrentPackageData->count(), 24);
    QVERIFY(player()->hasFocus());
    press({DEVICE_RIGHT_KEY});
    QCOMPARE(player()->playArray().size(), 24);
    QCOMPARE(player()->playArray().at(23), 23);
}

void TestImageSlide::theLastPagesJoinIfWanted()
{
    serve(19);
    open("WholeList=true\n");
    QTRY_COMPARE(HomeWidget::mCurrentPackageData->count(), 16);
    show(8);
    QTRY_COMPARE(HomeWidget::mCurrentPackageData->count(), 19);
    for (int i = 0; i < 20; ++i)
        press({DEVICE_RIGHT_KEY});
    QCOMPARE(player()->position(), 18);
}

void TestImageSlide::returnSelectsTheRecord()
{
    serve(40);
    open();
    QTRY_COMPARE(HomeWidget::mCurrentPackageData->count(), 16);
    show(0);
    for (int i = 0; i < 11; ++i)
        press({DEVICE_RIGHT_KEY});
    QSignalSpy left(player(), &QImageSlide::returnImageSlideUpdate);
    press({DEVICE_RETURN_KEY});
    QCOMPARE(left.value(0), QVariantList({12}));
    QTRY_VERIFY(!mPage->homeScreen()->isLoading());
    QCOMPARE(mPage->homeScreen()->startIndex(), 9);
    QVERIFY(mPage->findChild<FormScrollArea *>()->content()->cell(3)->hasFocus());
    QVERIFY(Download::mPhotoSlideShowUrlHash.isEmpty());
}

void TestImageSlide::aPhotoIsThereBeforeItsTurn()
{
    serve(4);
    open();
    show(0);
    QCOMPARE(label()->placeholder(), kLoading);
    auto *photos = player()->findChild<SlidePhotos *>();
    const QString next = mServer->url(pathOf(2));
    QTRY_VERIFY(photos->isPrepared(next));
    QTRY_VERIFY(showsPhoto());
    QCOMPARE(label()->slide().photo.size(), QSize(1280, 720));
    QCOMPARE(requestsOf(3), 0);
    PhotoManager::clearAll(); // prepared is prepared
    press({DEVICE_RIGHT_KEY});
    QVERIFY(showsPhoto());
    QTRY_VERIFY(photos->isPrepared(mServer->url(pathOf(3))));
    press({DEVICE_LEFT_KEY});
    QVERIFY(showsPhoto());
    QCOMPARE(requestsOf(2), 1);
}

void TestImageSlide::thumbnailsStandIn()
{
    serve(1);
    mServer->on("/p1.png", MisbehavingServer::answer(encoded(plain(8, 8), "PNG")));
    for (bool isSharpened : {false, true}) {
        open(isSharpened ? "Sharpen=true\n" : "");
        QTRY_VERIFY(PhotoManager::getPhoto(mServer->url("/p1.png")));
        show(0);
        QVERIFY(showsPhoto());
        QCOMPARE(label()->slide().photo.size(), QSize(720, 720));
        QCOMPARE(Download::mPhotoSlideShowUrlHash.isEmpty(), !isSharpened);
    }
    QTRY_COMPARE(label()->slide().photo.size(), QSize(1280, 720));
}

void TestImageSlide::failingPhotosDoNotStopThePlay()
{
    serve(5);
    mServer->on(pathOf(2), MisbehavingServer::answer("no picture"));
    mServer->on(pathOf(3), MisbehavingServer::reset());
    open();
    play(0);
    QTRY_VERIFY(showsPhoto());
    for (int position : {1, 2}) {
        player()->update();
        QCOMPARE(player()->position(), position);
        QTRY_COMPARE(label()->placeholder(), kFailed);
    }
    player()->update();
    QTRY_VERIFY(showsPhoto());
    QVERIFY(player()->isPlaying());
}

// More of them than there are connections.
void TestImageSlide::photosThatNeverComeBlockNobody()
{
    serve(16);
    answerPhotos(1, 15, MisbehavingServer::silence());
    open("Ahead=2\n");
    QTRY_COMPARE(HomeWidget::mCurrentPackageData->count(), 16);
    play(0);
    for (int i = 0; i < 15; ++i) {
        QCOMPARE(label()->placeholder(), kLoading);
        player()->update();
    }
    QTRY_VERIFY(showsPhoto());
    QVERIFY(Download::mPhotoSlideShowUrlHash.size() <= 1);
    press({DEVICE_RETURN_KEY});
    QVERIFY(!QImageSlide::mIsShowing);
}

void TestImageSlide::aTurnWaitsForItsPhoto()
{
    serve(4);
    HeldAnswers held;
    mServer->on(pathOf(2), held.hold());
    mServer->on(pathOf(3), MisbehavingServer::silence());
    open("WaitForPhoto=true\n");
    play(0);
    QTRY_COMPARE(held.count(), 1);
    QTRY_VERIFY(showsPhoto());
    player()->update();
    QCOMPARE(player()->position(), 0);
    held.answerFirst(MisbehavingServer::answer(encoded(plain(32, 18), "PNG")));
    QTRY_COMPARE(player()->position(), 1);
    QVERIFY(showsPhoto());
    player()->update();
    QCOMPARE(player()->position(), 1);
    player()->update(); // one turn more, no longer
    QCOMPARE(player()->position(), 2);
}

void TestImageSlide::allUnreadableCanBeLeft()
{
    serve(6);
    answerPhotos(1, 6, MisbehavingServer::answer("no picture"));
    open("Loop=true\nSkipUnreadable=true\nWaitForPhoto=true\nAhead=3\n");
    play(0);
    for (int turn = 0; turn < 30; ++turn) {
        player()->update();
        QTRY_COMPARE(label()->placeholder(), kFailed);
    }
    QVERIFY(QImageSlide::mIsShowing);
    press({DEVICE_RETURN_KEY});
    QVERIFY(mPage->homeScreen()->isVisible());
    QCOMPARE(mReports->last(), kStopped);
}

void TestImageSlide::roundsFollowEachOther()
{
    serve(4);
    mServer->on(pathOf(2), MisbehavingServer::answer("no picture"));
    open("Loop=true\nSkipUnreadable=true\n");
    play(0);
    QTRY_VERIFY(player()->findChild<SlidePhotos *>()->hasFailed(mServer->url(pathOf(2))));
    QVector<int> positions;
    for (int i = 0; i < 5; ++i) {
        player()->update();
        positions << player()->position();
    }
    QCOMPARE(positions, QVector<int>({2, 3, 0, 2, 3}));
}

void TestImageSlide::keysDuringADownload_data()
{
    QTest::addColumn<QByteArray>("options");
    QTest::addColumn<bool>("isAnswered");

    QTest::newRow("plain") << QByteArray() << false;
    QTest::newRow("answered") << QByteArray("KeysWhileLoading=true\n") << true;
}

// The list goes while it is played, and does not come back soon.
void TestImageSlide::keysDuringADownload()
{
    QFETCH(QByteArray, options);
    QFETCH(bool, isAnswered);
    serve(12);
    open(options);
    QTRY_COMPARE(HomeWidget::mCurrentPackageData->count(), 12);
    play(9);
    HeldAnswers held;
    mServer->on(kFeatured, held.hold());
    PackageManager::clearAll();
    player()->update();
    QTRY_VERIFY(mPage->homeScreen()->isLoading());
    QTRY_VERIFY(held.count() > 0);
    QVERIFY(player()->hasFocus());

    press({DEVICE_SETTING_KEY, DEVICE_RETURN_KEY, DEVICE_LEFT_KEY, DEVICE_PAUSE_KEY});
    QCOMPARE(!player()->isPlaying(), isAnswered);
    QVERIFY(QImageSlide::mIsShowing && player()->hasFocus());
    press({DEVICE_RETURN_KEY});
    QCOMPARE(!QImageSlide::mIsShowing, isAnswered);
    QCOMPARE(mReports->last(), isAnswered ? kStopped : kStarted);
}

void TestImageSlide::aShorterListEndsThePlay()
{
    SlideSetting::SlideMode = 2;
    serve(16);
    open();
    QTRY_COMPARE(HomeWidget::mCurrentPackageData->count(), 16);
    show(10);
    serve(2);
    PackageManager::clearAll();
    mPage->homeScreen()->showRecord(1);
    QTRY_VERIFY(!mPage->homeScreen()->isLoading());
    press({DEVICE_LEFT_KEY});
    QCOMPARE(player()->position(), 1);
    QTRY_VERIFY(showsPhoto());
    press({DEVICE_PLAY_KEY});
    serve(0);
    PackageManager::clearAll();
    mPage->homeScreen()->showRecord(1);
    QTRY_VERIFY(!mPage->homeScreen()->isLoading());
    player()->update();
    QVERIFY(!QImageSlide::mIsShowing);
    QCOMPARE(mReports->last(), kStopped);
}

void TestImageSlide::settingsAreKept()
{
    SlideSetting::SlideSpeed = 6;
    serve(3);
    open();
    player()->saveSetting();
    show(0);
    press({DEVICE_SETTING_KEY, DEVICE_UP_KEY, DEVICE_SELECT_KEY, DEVICE_UP_KEY, DEVICE_SELECT_KEY});
    press({DEVICE_UP_KEY, DEVICE_SELECT_KEY, DEVICE_DOWN_KEY, DEVICE_SELECT_KEY});
    press({DEVICE_DOWN_KEY, DEVICE_DOWN_KEY, DEVICE_SELECT_KEY});
    QVERIFY(player()->hasFocus() && !player()->isPlaying());
    QCOMPARE(SlideSetting::SlideMode, 1);
    QCOMPARE(SlideSetting::SlideSpeed, 5);
    QVERIFY(player()->playArray().at(0) != player()->playArray().at(1));
    QVERIFY(player()->playArray().at(1) != player()->playArray().at(2));
    press({DEVICE_PLAY_KEY});
    QCOMPARE(player()->interval(), 5000);
}

void TestImageSlide::aCancelledSettingChangesNothing()
{
    SlideSetting::SlideSpeed = 6;
    serve(3);
    open();
    play(0);
    for (int opening = 0; opening < 2; ++opening) {
        press({DEVICE_SETTING_KEY, DEVICE_UP_KEY});
        auto *panel = player()->findChild<SlideSetting *>();
        QVERIFY(panel && panel->isVisible());
        QCOMPARE(panel->speed(), 6);
        press({DEVICE_SELECT_KEY, DEVICE_DOWN_KEY, DEVICE_DOWN_KEY, DEVICE_SELECT_KEY});
        QCOMPARE(panel->speed(), 8);
        if (opening == 0)
            press({DEVICE_RETURN_KEY});
        else
            press({DEVICE_DOWN_KEY, DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY});
        QVERIFY(!panel->isVisible() && player()->hasFocus() && player()->isPlaying());
        QCOMPARE(SlideSetting::SlideSpeed, 6);
        QCOMPARE(player()->interval(), 6000);
    }
    press({DEVICE_SETTING_KEY});
    player()->update();
    player()->update();
    player()->update(); // the play goes on behind the panel, and ends
    QVERIFY(!QImageSlide::mIsShowing);
    QVERIFY(mPage->homeScreen()->isVisible());
}

void TestImageSlide::thePlatformHearsTheEnd()
{
    serve(3);
    open();
    play(0);
    mPage.reset(); // the user has been signed out
    QCOMPARE(mReports->last(), kStopped);
    QVERIFY(!QImageSlide::mIsShowing);
}

QTEST_MAIN(TestImageSlide)
#include "tst_imageslide.moc"
