#include "common/ui/qpopupform.h"
#include "common/ui/remotekeys.h"
#include "data/download.h"
#include "endtoend/remotecase.h"
#include "platform/ipc.h"
#include "ui/homewidget.h"
#include "ui/qimageslide.h"
#include "ui/slidesetting.h"
#include "ui/upwidget.h"

#include <algorithm>

namespace {

constexpr int waves = 105, trees = 5;
enum class From { Featured, Album, Search };

} // namespace

Q_DECLARE_METATYPE(From)

// Somebody who plays photos of a real album service, with the shell listening. A turn's end is the
// timer's slot being called, unless the test waits for the timer itself.
class TestSlidePlay : public RemoteCase
{
    Q_OBJECT

private slots:
    void initTestCase()
    {
        addPhotos("anna/Sea", "Wave", waves);
        addPhotos("anna/Forest", "Tree", trees);
        addPeople();
    }

    void init()
    {
        SlideSetting::SlideMode = 0;
        SlideSetting::SlideSpeed = 3600; // no turn ends by itself
        switchOn();
    }

    void cleanup() { switchOff(); }

    void playsToTheEnd_data()
    {
        QTest::addColumn<From>("origin");
        QTest::addColumn<QString>("words");
        QTest::addColumn<int>("mode");
        QTest::addColumn<bool>("isWhole");
        QTest::addColumn<int>("count");

        QTest::newRow("album") << From::Album << "Forest" << 0 << false << trees;
        QTest::newRow("album, random") << From::Album << "Forest" << 1 << false << trees;
        QTest::newRow("album, shuffled") << From::Album << "Sea" << 2 << false << waves;
        // Pages of 8 join until less than two are left: 17 - 24 at the 9th photo, ..., 97 - 104.
        QTest::newRow("featured") << From::Featured << QString() << 0 << false << 104;
        QTest::newRow("featured, shuffled, whole")
            << From::Featured << QString() << 2 << true << waves + trees;
        QTest::newRow("search") << From::Search << "tree" << 0 << false << trees;
        QTest::newRow("search, one block") << From::Search << "wave" << 1 << false << 100;
        QTest::newRow("search, whole, shuffled") << From::Search << "wave" << 2 << true << waves;
    }

    void playsToTheEnd()
    {
        QFETCH(int, mode);
        QFETCH(bool, isWhole);
        mTv->set("SlideShow/WholeList", isWhole ? "true" : "false");
        SlideSetting::SlideMode = mode;
        QFETCH(From, origin);
        QFETCH(QString, words);
        play(origin, words);
        if (QTest::currentTestFailed())
            return;

        QFETCH(int, count);
        const QStringList shown = playOut(origin == From::Featured ? count : 0);
        QCOMPARE(shown.size(), count);
        expectReport(2);
        if (mode == 1)
            QVERIFY(std::adjacent_find(shown.begin(), shown.end()) == shown.end());
        else
            QCOMPARE(QSet<QString>(shown.begin(), shown.end()).size(), shown.size());
        QTRY_VERIFY(mTv->home()->isVisible() && !mTv->isLoading());
        if (!isWhole) // the record selected has the number of the last turn
            QTRY_COMPARE(mTv->position().section('/', 0, 0).toInt(), count);
        QVERIFY(mTv->captions().contains(mTv->focus()));
    }

    void turnsByItselfAtTheSpeedChosen()
    {
        SlideSetting::SlideSpeed = 1;
        play(From::Album, "Forest");
        if (QTest::currentTestFailed())
            return;
        QTRY_COMPARE(player()->position(), 1);
        // Setting, up to the speed, one second more, down to OK.
        mTv->press({DEVICE_SETTING_KEY, DEVICE_UP_KEY, DEVICE_SELECT_KEY, DEVICE_DOWN_KEY,
                    DEVICE_SELECT_KEY, DEVICE_DOWN_KEY, DEVICE_SELECT_KEY});
        QCOMPARE(player()->interval(), 2000);
        QTRY_COMPARE(player()->position(), 2);
        QTRY_VERIFY(showsPhoto());
        mTv->press(DEVICE_SELECT_KEY);
        expectReport(2);
        mTv->press({DEVICE_RIGHT_KEY, DEVICE_RETURN_KEY});
        QTRY_COMPARE(mTv->position(), QString("4/%1").arg(trees));
    }

    void leavesWhenTheServiceHasGone()
    {
        mTv->set("SlideShow/WholeList", "true");
        play(From::Search, "wave");
        if (QTest::currentTestFailed())
            return;
        mService.kill();
        for (int turn = 0; turn < waves; ++turn) // into the block that cannot be had
            player()->update();
        QVERIFY(QImageSlide::mIsShowing && player()->hasFocus());
        QVERIFY(mService.start()); // and can again
        player()->update();
        QTRY_VERIFY(HomeWidget::mCurrentPackageData);
        QTRY_COMPARE(player()->position(), 0);
        QTRY_VERIFY(showsPhoto());
        mTv->press(DEVICE_RETURN_KEY);
        expectReport(2);
        QTRY_COMPARE(mTv->captions().size(), waves - 100);
    }

private:
    // Signs in, goes to the list and plays it.
    void play(From origin, const QString &words)
    {
        signIn(mService.url());
        if (origin == From::Album) {
            enter(UpWidget::MyPhotosEntry);
            QTRY_COMPARE(mTv->captions().size(), 2);
            walkTo(words);
            mTv->press(DEVICE_SELECT_KEY);
        } else if (origin == From::Search) {
            enter(UpWidget::SearchEntry);
            mTv->press(DEVICE_SELECT_KEY);
            type(words);
            QTRY_VERIFY(!mTv->shown<QPopUpForm>());
            mTv->press({DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY});
        }
        QTRY_VERIFY(mTv->position().startsWith("1/"));
        mTv->press(DEVICE_PLAY_KEY);
        QVERIFY(player()->isVisible());
        expectReport(0);
    }

    // The addresses of the photos shown, turn by turn, until the player leaves. Of a list whose
    // pages join one after the other, so many records: a turn waits for the page that it leads to.
    QStringList playOut(int inPages)
    {
        QStringList shown;
        while (QImageSlide::mIsShowing && shown.size() <= 2 * waves) {
            const QString url = Download::mCurrentSlideShowImageUrl;
            const auto isThere = [&] {
                const int wanted = qMin(player()->position() + 2, inPages);
                return showsPhoto() && !mTv->isLoading() && HomeWidget::mCurrentPackageData &&
                       HomeWidget::mCurrentPackageData->count() >= wanted;
            };
            if (!QTest::qWaitFor(isThere))
                return shown;
            shown << url;
            const auto hasTurned = [&] {
                return !QImageSlide::mIsShowing || Download::mCurrentSlideShowImageUrl != url;
            };
            player()->update();
            if (!QTest::qWaitFor(hasTurned)) // the next block of results may be on its way
                return shown;
        }
        return shown;
    }

    QImageSlide *player() const { return mTv->window()->findChild<QImageSlide *>(); }
    bool showsPhoto() const { return player()->label()->placeholder().isEmpty(); }
    void expectReport(int status);
};

void TestSlidePlay::expectReport(int status)
{
    const auto report = mTv->shell().next();
    QVERIFY(report && report->type == netcommon::MSG_PLAYBACK_INFO);
    QCOMPARE(report->params[0], 2);
    QCOMPARE(report->params[1], status);
}

int main(int argc, char *argv[])
{
    TestSlidePlay test;
    return RemoteCase::run(test, argc, argv);
}
#include "tst_slideplay.moc"
