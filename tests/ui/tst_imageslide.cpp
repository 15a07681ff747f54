#include "common/ui/qpopupdialog.h"
#include "data/download.h"
#include "platform/devicestate.h"
#include "ui/contentpages.h"
#include "ui/formscrollarea.h"
#include "ui/formscrollwidget.h"
#include "ui/homewidget.h"
#include "ui/qimageslide.h"
#include "ui/screencase.h"
#include "ui/slidemarks.h"
#include "ui/slidephotos.h"
#include "ui/slidesetting.h"
#include "ui/widget.h"

namespace {

const char *const kFeatured = "/data/feed/api/featured";
const QString kLoading = QStringLiteral(":/res/image_is_loading.png");
const QString kFailed = QStringLiteral(":/res/image_download_failed.png");
const QByteArray kAnsweringKeys = "KeysWhileLoading=true\n";
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
    void init()
    {
        NetworkCableStatus = true;
        SlideSetting::SlideMode = 0;
        SlideSetting::SlideSpeed = 3600; // no turn ends by itself
        startServer();
    }

    void cleanup()
    {
        mPage.reset();
        forgetAll();
    }

    void keysStepAndPause()
    {
        serve(3);
        open();
        show(0);
        QVERIFY(mReports->isEmpty() && marks()->isPauseShown() && !marks()->isPlayShown());
        QVERIFY(!marks()->isLeftShown() && marks()->isRightShown());
        press({DEVICE_LEFT_KEY});
        QCOMPARE(player()->position(), 0);
        press({DEVICE_RIGHT_KEY, DEVICE_NEXT_KEY, DEVICE_RIGHT_KEY, DEVICE_NEXT_KEY});
        QCOMPARE(player()->position(), 2);
        QVERIFY(marks()->isLeftShown() && !marks()->isRightShown());
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

    void aPhotoIsThereBeforeItsTurn()
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
        QCOMPARE(requestsFor(pathOf(3)), 0);
        PhotoManager::clearAll(); // prepared is prepared
        press({DEVICE_RIGHT_KEY});
        QVERIFY(showsPhoto());
        QTRY_VERIFY(photos->isPrepared(mServer->url(pathOf(3))));
        press({DEVICE_LEFT_KEY});
        QVERIFY(showsPhoto());
        QCOMPARE(requestsFor(pathOf(2)), 1);
    }

    void thumbnailsStandIn()
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

    void aTurnWaitsForItsPhoto()
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

    void roundsFollowEachOther()
    {
        serve(4);
        for (int unreadable : {2, 4})
            mServer->on(pathOf(unreadable), MisbehavingServer::answer("no picture"));
        open("Loop=true\nSkipUnreadable=true\nAhead=2\n");
        play(0);
        auto *photos = player()->findChild<SlidePhotos *>();
        QVector<int> positions;
        for (int i = 0; i < 5; ++i) {
            for (int ahead : {1, 2}) // also the first photo of the next round
                QTRY_VERIFY(photos->isSettled(
                    mServer->url(pathOf((player()->position() + ahead) % 4 + 1))));
            player()->update();
            positions << player()->position();
        }
        QCOMPARE(positions, QVector<int>({2, 0, 2, 0, 2}));
    }

    void returnSelectsTheRecord()
    {
        serve(40);
        SlideSetting::SlideMode = 2;
        open("ReturnToPhoto=true\n");
        QTRY_COMPARE(HomeWidget::mCurrentPackageData->count(), 16);
        show(0);
        const auto isInOrder = [this] {
            return player()->playArray().at(player()->position()) == player()->position();
        };
        while (player()->position() < 7 || isInOrder())
            press({DEVICE_RIGHT_KEY});
        const int record = player()->playArray().at(player()->position());
        QSignalSpy left(player(), &QImageSlide::returnImageSlideUpdate);
        press({DEVICE_RETURN_KEY});
        QCOMPARE(left.value(0), QVariantList({record + 1}));
        QTRY_VERIFY(!mPage->homeScreen()->isLoading());
        QCOMPARE(mPage->homeScreen()->startIndex(), record / 8 * 8 + 1);
        QVERIFY(mPage->findChild<FormScrollArea *>()->content()->cell(record % 8)->hasFocus());
        QVERIFY(Download::mPhotoSlideShowUrlHash.isEmpty());
    }

    // The list goes while it is played, and comes back late and shorter.
    void keysWaitForTheList()
    {
        HeldAnswers held;
        loseList(held.hold(), QByteArray());
        QTRY_VERIFY(mPage->homeScreen()->isLoading() && held.count() > 0);
        press({DEVICE_RETURN_KEY, DEVICE_PAUSE_KEY});
        QVERIFY(player()->isPlaying() && player()->hasFocus());
        serve(12);
        held.answerFirst(MisbehavingServer::answer(sample::photos("Photo", 1, 2, 2)));
        QTRY_VERIFY(!mPage->homeScreen()->isLoading());
        press({DEVICE_PAUSE_KEY, DEVICE_RETURN_KEY});
        QVERIFY(!QImageSlide::mIsShowing);
        QCOMPARE(mReports->last(), kStopped);
    }

    void anythingCanBeLeft_data();
    void anythingCanBeLeft();
    void settingsAreKept()
    {
        SlideSetting::SlideSpeed = 6;
        serve(3);
        open();
        player()->saveSetting();
        show(0);
        press({DEVICE_SETTING_KEY, DEVICE_UP_KEY, DEVICE_SELECT_KEY, DEVICE_UP_KEY,
               DEVICE_SELECT_KEY});
        press({DEVICE_UP_KEY, DEVICE_SELECT_KEY, DEVICE_DOWN_KEY, DEVICE_SELECT_KEY});
        press({DEVICE_DOWN_KEY, DEVICE_DOWN_KEY, DEVICE_SELECT_KEY});
        QVERIFY(player()->hasFocus() && !player()->isPlaying());
        QCOMPARE(SlideSetting::SlideMode, 1);
        QCOMPARE(SlideSetting::SlideSpeed, 5);
        QVERIFY(player()->playArray().at(0) != player()->playArray().at(1));
        QVERIFY(player()->playArray().at(1) != player()->playArray().at(2));
        press({DEVICE_PLAY_KEY});
        QCOMPARE(player()->interval(), 5000);

        // A cancelled edit is forgotten, and the play goes on behind the panel, to its end.
        press({DEVICE_SETTING_KEY, DEVICE_UP_KEY, DEVICE_SELECT_KEY, DEVICE_DOWN_KEY});
        press({DEVICE_SELECT_KEY, DEVICE_DOWN_KEY, DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY});
        QVERIFY(player()->hasFocus() && player()->isPlaying());
        QVERIFY(SlideSetting::SlideSpeed == 5 && player()->interval() == 5000);
        press({DEVICE_SETTING_KEY});
        QCOMPARE(player()->findChild<SlideSetting *>()->speed(), 5);
        for (int turn = 0; turn < 3; ++turn)
            player()->update();
        QVERIFY(!QImageSlide::mIsShowing && mPage->homeScreen()->isVisible());
    }

    void settingsStopAtTheirEnds()
    {
        SlideSetting::SlideSpeed = 6;
        SlideSetting panel;
        ScreenCase::show(&panel);
        panel.load();
        press({DEVICE_UP_KEY, DEVICE_SELECT_KEY, DEVICE_UP_KEY, DEVICE_UP_KEY});
        QCOMPARE(panel.speed(), 5);
        press({DEVICE_SELECT_KEY, DEVICE_UP_KEY, DEVICE_SELECT_KEY, DEVICE_UP_KEY});
        QCOMPARE(panel.mode(), 0);
        press({DEVICE_DOWN_KEY, DEVICE_DOWN_KEY, DEVICE_DOWN_KEY});
        QCOMPARE(panel.mode(), 2);
    }

    void thePlatformHearsTheEnd()
    {
        serve(3);
        open();
        play(0);
        mPage.reset(); // the user has been signed out
        QCOMPARE(mReports->last(), kStopped);
        QVERIFY(!QImageSlide::mIsShowing);
    }

public:
    using Trouble = void (TestImageSlide::*)();

private:
    void onePhoto()
    {
        serve(1);
        open(kAnsweringKeys + "Loop=true\n");
        play(0);
        for (int turn = 0; turn < 3; ++turn)
            player()->update();
        QTRY_VERIFY(showsPhoto());
        QVERIFY(!marks()->isLeftShown() && !marks()->isRightShown());
    }

    void fewerPhotos()
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
    }

    // More of them than there are connections.
    void silentPhotos()
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
    }

    // Each takes its turn, or is skipped as long as there are others.
    void unreadablePhotos()
    {
        serve(6);
        answerPhotos(1, 3, MisbehavingServer::answer("no picture"));
        answerPhotos(4, 6, MisbehavingServer::reset());
        for (const char *options : {"", "SkipUnreadable=true\nWaitForPhoto=true\nAhead=3\n"}) {
            open(QByteArray("Loop=true\n") + options);
            play(0);
            for (int turn = 0; turn < 15; ++turn) {
                player()->update();
                QVERIFY(*options || player()->position() == (turn + 1) % 6);
                QTRY_COMPARE(label()->placeholder(), kFailed);
            }
        }
    }

    void lostList()
    {
        loseList(MisbehavingServer::silence(), kAnsweringKeys);
        QTRY_VERIFY(mPage->homeScreen()->isLoading());
    }

    void refusedList()
    {
        loseList(MisbehavingServer::answer("", 401), kAnsweringKeys);
        QTRY_VERIFY(!mPage->findChild<FailurePage *>()->reason().isEmpty());
    }

    // With the settings opened and cancelled while the list is on its way.
    void loseList(const MisbehavingServer::Behaviour &behaviour, const QByteArray &options)
    {
        serve(12);
        open(options);
        QTRY_COMPARE(HomeWidget::mCurrentPackageData->count(), 12);
        play(9);
        mServer->on(kFeatured, behaviour);
        PackageManager::clearAll();
        player()->update();
        press({DEVICE_SETTING_KEY, DEVICE_RETURN_KEY, DEVICE_LEFT_KEY});
    }

    // Featured photos 1 to total, as many a page as asked for; their thumbnails do not exist.
    void serve(int total)
    {
        mServer->on(kFeatured, pages(total, total, [this](int number) {
                        return sample::photo("Photo",
                                             mServer->url(QString("/p%1.png").arg(number)));
                    }));
        answerPhotos(1, total, MisbehavingServer::answer(encoded(plain(32, 18), "PNG")));
    }

    void answerPhotos(int first, int last, const MisbehavingServer::Behaviour &behaviour)
    {
        for (int i = first; i <= last; ++i)
            mServer->on(pathOf(i), behaviour);
    }

    void open(const QByteArray &slideShow = QByteArray())
    {
        configure("[SlideShow]\n" + slideShow);
        mPage.reset(); // one at a time
        mPage = std::make_unique<Widget>();
        ScreenCase::show(mPage.get());
        QTRY_VERIFY(!mPage->homeScreen()->isLoading());
        mReports = std::make_unique<QSignalSpy>(player(), &QImageSlide::signalUpdatePlaybackinfo);
    }

    void play(int index) { emit mPage->homeScreen()->slidePlay(index); }
    void show(int index) { emit mPage->homeScreen()->slideShow(index); }
    QImageSlide *player() const { return mPage->player(); }
    SlideLabel *label() const { return player()->label(); }
    SlideMarks *marks() const { return player()->findChild<SlideMarks *>(); }
    bool showsPhoto() const { return label()->placeholder().isEmpty(); }

    std::unique_ptr<Widget> mPage;
    std::unique_ptr<QSignalSpy> mReports;
};

Q_DECLARE_METATYPE(TestImageSlide::Trouble)

void TestImageSlide::anythingCanBeLeft_data()
{
    QTest::addColumn<Trouble>("trouble");

    QTest::newRow("a single photo") << &TestImageSlide::onePhoto;
    QTest::newRow("a feed that shrinks") << &TestImageSlide::fewerPhotos;
    QTest::newRow("photos that never arrive") << &TestImageSlide::silentPhotos;
    QTest::newRow("all unreadable") << &TestImageSlide::unreadablePhotos;
    QTest::newRow("a list that is lost") << &TestImageSlide::lostList;
    QTest::newRow("a list that is refused") << &TestImageSlide::refusedList;
}

// Keys answer, Return leaves, the platform hears that the play has stopped, and a question that
// there is on the home screen can be answered.
void TestImageSlide::anythingCanBeLeft()
{
    QFETCH(Trouble, trouble);
    (this->*trouble)();
    if (QTest::currentTestFailed())
        return;
    QVERIFY(player()->hasFocus() && player()->isPlaying());
    press({DEVICE_SETTING_KEY, DEVICE_UP_KEY, DEVICE_RETURN_KEY, DEVICE_PAUSE_KEY});
    QVERIFY(player()->hasFocus() && !player()->isPlaying());
    QCOMPARE(mReports->last(), kStopped);
    press({DEVICE_RIGHT_KEY, DEVICE_LEFT_KEY, DEVICE_PLAY_KEY});
    QCOMPARE(mReports->last(), kStarted);
    press({DEVICE_RETURN_KEY});
    QVERIFY(!QImageSlide::mIsShowing && mPage->homeScreen()->isVisible());
    QCOMPARE(mReports->last(), kStopped);
    if (trouble == &TestImageSlide::refusedList)
        QTRY_VERIFY(mPage->findChild<QPopupDialog *>() &&
                    mPage->findChild<QPopupDialog *>()->hasFocus());
}

QTEST_MAIN(TestImageSlide)
#include "tst_imageslide.moc"
