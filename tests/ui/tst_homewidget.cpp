#include "accountmanager/accountmanagerhelper.h"
#include "common/ui/qconfirm.h"
#include "common/ui/qpopupdialog.h"
#include "common/ui/qprogressindicator.h"
#include "data/download.h"
#include "platform/devicestate.h"
#include "ui/contentpages.h"
#include "ui/formscrollarea.h"
#include "ui/formscrollwidget.h"
#include "ui/homebars.h"
#include "ui/homewidget.h"
#include "ui/photoitem.h"
#include "ui/screencase.h"
#include "ui/upwidget.h"

namespace {

const char *const kFeatured = "/data/feed/api/featured";
const char *const kMyAlbums = "/data/feed/api/user/default";
const char *const kPeople = "/data/feed/api/user/default/contacts";

const auto answer = [](const QByteArray &feed) { return MisbehavingServer::answer(feed); };

} // namespace

// The home screen by key presses, against a server of its own.
class TestHomeWidget : public ScreenCase
{
    Q_OBJECT

private slots:
    void init()
    {
        NetworkCableStatus = true;
        startServer();
        mServer->on(kFeatured, answer(sample::photos("Photo", 1, 8, 8)));
        mServer->on(kMyAlbums, answer(sample::albums("me", 11)));
        mServer->on(kPeople, answer(sample::people(3)));
        mServer->on("/data/feed/api/user/me/albumid/a10",
                    answer(sample::photos("Holiday", 1, 10, 0)));
    }

    void cleanup()
    {
        mHome.reset();
        forgetAll();
    }

    void anEmptyListLeavesTheMenu()
    {
        mServer->on(kMyAlbums, answer(sample::albums("me", 0)));
        open();
        enterMenu(UpWidget::MyPhotosEntry);
        QTRY_VERIFY(isReady());
        QVERIFY(mHome->findChild<NoPhotoAvailableWidget *>()->isVisible());
        QVERIFY(menu()->hasFocus());
        press({DEVICE_DOWN_KEY});
        QVERIFY(menu()->hasFocus());
    }

    // After the patience is over: shown when it is wanted still, but without the focus, which a
    // question has meanwhile; and not shown when it is not wanted.
    void lateAnswers()
    {
        HeldAnswers held;
        mServer->on(kPeople, held.hold());
        open("[Network]\nPageSeconds=1\n");
        for (bool isWanted : {true, false}) {
            enterMenu(UpWidget::FavoritesEntry);
            QTRY_VERIFY(failure()->isVisible());
            press({DEVICE_RETURN_KEY});
            QVERIFY(menu()->hasFocus());
            if (isWanted) {
                press({DEVICE_RETURN_KEY});
            } else {
                enterMenu(UpWidget::MyPhotosEntry);
                QTRY_COMPARE(captions().size(), 8);
            }
            const int before = LogCapture::lines().filter("try to show CurrentPackage").size();
            held.answerFirst(answer(sample::people(3)));
            QTRY_VERIFY(LogCapture::lines().filter("try to show CurrentPackage").size() > before);
            QCOMPARE(captions().size(), isWanted ? 3 : 8);
            if (isWanted)
                press({DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY}); // no
            QVERIFY(!mHome->findChild<QConfirm *>() ||
                    !mHome->findChild<QConfirm *>()->isVisible());
            PackageManager::clearAll();
        }
    }

    void keysWhileLoadingAreDropped()
    {
        HeldAnswers held;
        mServer->on(kPeople, held.hold());
        open();
        enterMenu(UpWidget::FavoritesEntry);
        QTRY_COMPARE(held.count(), 1);
        press({DEVICE_RETURN_KEY, DEVICE_UP_KEY, DEVICE_RED_KEY, DEVICE_SELECT_KEY});
        QVERIFY(mHome->isLoading());
        QVERIFY(LogCapture::contains(" it is downloading data now, so no key press events!"));
        held.answerFirst(answer(sample::people(3)));
        QTRY_VERIFY(isReady());
        QCOMPARE(captions().size(), 3);
        NetworkCableStatus = false;
        press({DEVICE_RIGHT_KEY, DEVICE_RETURN_KEY});
        QVERIFY(grid()->content()->cell(0)->hasFocus());
    }

    void theCacheMayLetGo()
    {
        open();
        enterMenu(UpWidget::MyPhotosEntry);
        QTRY_VERIFY(isReady());
        for (int key : {DEVICE_SELECT_KEY, DEVICE_PAGEDOWN_KEY}) {
            PackageManager::clearAll();
            QVERIFY(!HomeWidget::mCurrentPackageData);
            press({key});
            QTRY_VERIFY(isReady());
            QVERIFY(HomeWidget::mCurrentPackageData);
            QCOMPARE(captions().first(), QString("Album 1\n1 photo"));
        }
        press({DEVICE_PAGEDOWN_KEY});
        QCOMPARE(captions().first(), QString("Album 9\n9 photos"));
    }

    void aBrokenPageAheadIsForgotten()
    {
        int asked = 0;
        mServer->on(kFeatured, [&](QTcpSocket *socket, const MisbehavingServer::Request &request) {
            const bool isAhead = asked++ == 1;
            (isAhead ? MisbehavingServer::html()
                     : answer(sample::photos("Photo", 1, 8, 16)))(socket, request);
        });
        open();
        QTRY_VERIFY(!HomeWidget::mCurrentPackageData->mIsFeed);
        press({DEVICE_RED_KEY});
        QTRY_COMPARE(asked, 4); // anew, and again ahead
        QTRY_COMPARE(captions().size(), 8);
        QVERIFY(grid()->content()->cell(0)->hasFocus());
    }

    // Which the request for a list that is out of date has joined.
    void aPageAheadComesAlone()
    {
        const auto photos =
            pages(40, 40, [](int number) { return sample::photo("P" + QString::number(number)); });
        mServer->on(kFeatured, photos);
        open();
        QTRY_COMPARE(HomeWidget::mCurrentPackageData->count(), 16);
        HeldAnswers held;
        mServer->on(kFeatured, held.hold());
        press({DEVICE_PAGEDOWN_KEY});
        QTRY_COMPARE(held.count(), 1);
        PackageProperty list = mHome->state().mCurrentProperty;
        PackageManager::removeCache(list);
        press({DEVICE_RED_KEY});
        mServer->on(kFeatured, photos);
        held.answerFirst(answer(sample::photos("P", 17, 24, 40)));
        QTRY_COMPARE(captions().value(0), QString("P1"));
        QTRY_COMPARE(HomeWidget::mCurrentPackageData->count(), 16);
        QCOMPARE(requestsFor(kFeatured), 5);
    }

    void thumbnailsAreShownUndistorted()
    {
        mServer->on("/portrait.png", answer(encoded(plain(30, 60), "PNG")));
        mServer->on(kFeatured, answer(sample::feed(
                                   {sample::photo("Tall", mServer->url("/portrait.png"))}, 1)));
        open();
        QTRY_VERIFY(Download::mHomeLabelUrlHash.isEmpty());
        auto *cell = mHome->findChild<PhotoItem *>();
        const QImage shown = cell->picture().toImage();
        QCOMPARE(shown.size(), cell->imageSize());
        const auto isRed = [&](int fromMiddle) {
            const QPoint middle = shown.rect().center();
            return shown.pixelColor(middle + QPoint(fromMiddle, 0)) == QColor(Qt::red);
        };
        const int quarter = shown.height() / 4; // half of its width
        QVERIFY(isRed(0) && isRed(quarter - 3) && !isRed(quarter + 3));
    }

    void hostileTextsStayPlain()
    {
        QString nested = QString("<table>").repeated(5000);
        mServer->on(kMyAlbums,
                    answer(sample::feed({sample::album("<img src='/etc/passwd'>", 1, "a1"),
                                         sample::album(nested + QString(200000, 'x'), 2, "a2"),
                                         sample::album("two\nlines", 3, "a3")},
                                        3)));
        mServer->on("/data/feed/api/user/owner/albumid/a1", answer(sample::photos("P", 1, 1, 0)));
        open();
        enterMenu(UpWidget::MyPhotosEntry);
        QTRY_COMPARE(captions().size(), 3);
        QVERIFY(captions().at(1).size() < 60);
        QCOMPARE(captions().at(2), QString("two lines\n3 photos"));
        press({DEVICE_SELECT_KEY});
        QTRY_VERIFY(isReady());
        QVERIFY(bars()->information().contains("<b>&lt;img src='/etc/passwd'&gt;</b>"));
        menu()->setUserName("<b>Al</b>\nB");
        QCOMPARE(menu()->shownUserName(), QString("<b>Al</b> B"));
        menu()->setUserName(QString(100000, 'W'));
        QVERIFY(menu()->shownUserName().size() < 40);
    }

    void anExpiredSignInLeadsToTheAccounts()
    {
        mServer->on(kPeople, MisbehavingServer::answer("", 401));
        open();
        QSignalSpy left(mHome.get(), &HomeWidget::signedOut);
        enterMenu(UpWidget::FavoritesEntry);
        QTRY_VERIFY(mHome->findChild<QPopupDialog *>());
        press({DEVICE_SELECT_KEY});
        QCOMPARE(left.size(), 1);
    }

    void theIndicatorTicksOnlyWhenSeen()
    {
        QProgressIndicator indicator;
        indicator.startAnimation();
        QVERIFY(!indicator.isTicking());
        indicator.show();
        QVERIFY(indicator.isTicking());
        indicator.hide();
        QVERIFY(!indicator.isTicking());
    }

private:
    void open(const QByteArray &settings = QByteArray())
    {
        configure(settings);
        mHome = std::make_unique<HomeWidget>();
        show(mHome.get());
        QTRY_VERIFY(isReady());
    }

    void enterMenu(int entry)
    {
        press({DEVICE_UP_KEY, DEVICE_UP_KEY});
        QVERIFY(menu()->hasFocus());
        while (menu()->focusIndex() < entry)
            press({DEVICE_RIGHT_KEY});
        while (menu()->focusIndex() > entry)
            press({DEVICE_LEFT_KEY});
        press({DEVICE_SELECT_KEY});
    }

    QStringList captions() const
    {
        QStringList shown;
        const auto cells = mHome->findChildren<PhotoItem *>();
        for (const PhotoItem *cell : cells) {
            if (cell->isVisible())
                shown << cell->caption();
        }
        return shown;
    }

    FormScrollArea *grid() const { return mHome->findChild<FormScrollArea *>(); }
    UpWidget *menu() const { return mHome->findChild<UpWidget *>(); }
    HomeBars *bars() const { return mHome->findChild<HomeBars *>(); }
    FailurePage *failure() const { return mHome->findChild<FailurePage *>(); }
    bool isReady() const { return !mHome->isLoading(); }

    std::unique_ptr<HomeWidget> mHome;
};

QTEST_MAIN(TestHomeWidget)
#include "tst_homewidget.moc"
