#include "base/i18n.h"
#include "common/ui/qkeyboardinput.h"
#include "common/ui/qpopupdialog.h"
#include "common/ui/qpopupform.h"
#include "common/ui/remotekeys.h"
#include "data/download.h"
#include "data/packagemanager.h"
#include "data/photomanager.h"
#include "endtoend/relay.h"
#include "endtoend/remotecase.h"
#include "ui/detailstage.h"
#include "ui/detailtexts.h"
#include "ui/homewidget.h"
#include "ui/notelist.h"
#include "ui/picturedetailwidget.h"
#include "ui/screentexts.h"
#include "ui/sendingnotice.h"
#include "ui/upwidget.h"

#include <QTimer>

namespace {

constexpr int photos = 12;

using Behaviour = MisbehavingServer::Behaviour;
using Request = MisbehavingServer::Request;

struct Misbehaviour
{
    const char *name;
    Behaviour behaviour;
    int failure; // of a page, in ScreenTexts
    int prompt;  // after a posting, in I18n
};

QList<Misbehaviour> misbehaviours()
{
    return {{"time-out", MisbehavingServer::silence(), ScreenTexts::PageTooSlow, 11},
            {"401", MisbehavingServer::answer("{}", 401), ScreenTexts::PageRefused, 6},
            {"404", MisbehavingServer::answer("{}", 404), ScreenTexts::PageNotFound, 12},
            {"500", MisbehavingServer::answer("oops", 500), ScreenTexts::PageFailed, 6},
            {"HTML", MisbehavingServer::html(), ScreenTexts::PageFailed, 6},
            {"cut body", MisbehavingServer::cut("{\"feed\":{\"entry\":[{", 5000),
             ScreenTexts::PageFailed, 6},
            {"reset", MisbehavingServer::reset(), ScreenTexts::PageFailed, 6}};
}

} // namespace

// Somebody in front of the whole program, behind a relay that spoils some of the service's answers.
class TestBadService : public RemoteCase
{
    Q_OBJECT

private slots:
    void initTestCase()
    {
        addPhotos("anna/Sea", "Wave", photos - 2);
        addPhotos("ben/Party", "Guest", 1);
        addPhotos("carl/Town", "Square", 1);
        addPeople();
        QVERIFY(mService.start());
        QVERIFY(mService.waitForPhotos(photos));
    }

    void init()
    {
        if (mTv)
            return;
        mTv = std::make_unique<Television>();
        mTv->set("Network/SilenceSeconds", 1);
        mRelay = std::make_unique<MisbehavingServer>(MisbehavingServer::Tls);
        heal();
        signIn(mRelay->url({}));
    }

    // Where the next one begins.
    void cleanup()
    {
        if (QTest::currentTestFailed()) {
            mTv.reset();
            return;
        }
        heal();
        forgetAll();
        mTv->press(DEVICE_RED_KEY);
        QTRY_VERIFY(isListed(QStringLiteral("1/%1").arg(photos), 8));
    }

    void cleanupTestCase() { switchOff(); }

    void lists_data()
    {
        struct List
        {
            const char *name;
            QList<int> entries; // of the menu; the cell with the focus is then opened
            QByteArray address;
            int cells;
        };
        const QList<List> lists{
            {"featured", {UpWidget::HomeEntry}, "/featured", 8},
            {"albums", {UpWidget::MyPhotosEntry}, "/user/default?", 1},
            {"album", {UpWidget::MyPhotosEntry, DEVICE_SELECT_KEY}, "/albumid/", 8},
            {"people", {UpWidget::FavoritesEntry}, "/contacts", 2},
            {"person", {UpWidget::FavoritesEntry, DEVICE_SELECT_KEY}, "/api/user/2?", 1},
            {"results", {UpWidget::SearchEntry}, "/api/all", 8}};
        QTest::addColumn<Behaviour>("behaviour");
        QTest::addColumn<int>("failure");
        QTest::addColumn<QList<int>>("way");
        QTest::addColumn<QByteArray>("address");
        QTest::addColumn<int>("cells");
        for (const List &list : lists) {
            for (const Misbehaviour &bad : misbehaviours())
                QTest::addRow("%s: %s", list.name, bad.name)
                    << bad.behaviour << bad.failure << list.entries << list.address << list.cells;
        }
    }

    void lists()
    {
        QFETCH(Behaviour, behaviour);
        QFETCH(QByteArray, address);
        QFETCH(QList<int>, way);
        QFETCH(int, failure);
        const auto open = [&] {
            enter(way.first());
            if (way.first() == UpWidget::SearchEntry) {
                mTv->press(DEVICE_SELECT_KEY);
                type("wave");
                QTRY_VERIFY(!mTv->shown<QPopUpForm>());
                mTv->press({DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY});
            }
            if (way.size() > 1) {
                QTRY_VERIFY(!mTv->isLoading());
                mTv->press(way.last());
            }
        };
        forgetAll();
        spoil(behaviour, "GET", address);
        open();
        expectFailure(failure);
        mTv->press(DEVICE_RETURN_KEY); // to what can be had, or the menu
        QTRY_VERIFY(!mTv->isLoading());
        QVERIFY(!mTv->focus().isEmpty());

        open();
        expectFailure(failure);
        mTv->press(DEVICE_SELECT_KEY); // in vain
        expectFailure(failure);
        heal();
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_VERIFY(!mTv->isLoading());
        QTEST(int(mTv->captions().size()), "cells");
        QVERIFY(mTv->failure().isEmpty());
    }

    void photo_data()
    {
        QTest::addColumn<Behaviour>("behaviour");
        QTest::addColumn<int>("failure");
        for (const Misbehaviour &bad : misbehaviours())
            QTest::newRow(bad.name) << bad.behaviour << bad.failure;
    }

    void photo()
    {
        QFETCH(Behaviour, behaviour);
        QFETCH(int, failure);
        const int message = failure == ScreenTexts::PageNotFound ? DetailTexts::PhotoGone
                                                                 : DetailTexts::PhotoFailed;
        PhotoManager::clearAll();
        spoil(behaviour, "GET", "/photos/");
        openPhoto();
        QTRY_COMPARE(mTv->shown<DetailStage>()->message(), DetailTexts::text(message));
        heal();
        mTv->press(DEVICE_RIGHT_KEY);
        QTRY_VERIFY(!mTv->shown<DetailStage>()->picture().isNull());
        mTv->press(DEVICE_LEFT_KEY); // it is asked for anew
        QTRY_VERIFY(!mTv->shown<DetailStage>()->picture().isNull());
        QVERIFY(mTv->shown<DetailStage>()->message().isEmpty());
        leavePhoto(1);
    }

    void notes_data()
    {
        QTest::addColumn<Behaviour>("behaviour");
        QTest::addColumn<int>("action");
        for (const Misbehaviour &bad : misbehaviours()) {
            QTest::addRow("comments: %s", bad.name)
                << bad.behaviour << int(DetailAction::AllComments);
            QTest::addRow("tags: %s", bad.name) << bad.behaviour << int(DetailAction::TagList);
        }
    }

    void notes()
    {
        QFETCH(Behaviour, behaviour);
        QFETCH(int, action);
        spoil(behaviour, "GET", "/photoid/");
        openPhoto();
        runOnPhoto(DetailAction(action));
        QVERIFY(mTv->shown<NoteList>());
        QTRY_COMPARE(mTv->shown<NoteList>()->message(),
                     ScreenTexts::failure(ScreenTexts::PageFailed));
        heal();
        mTv->press({DEVICE_RETURN_KEY, DEVICE_SELECT_KEY});
        QTRY_COMPARE(mTv->shown<NoteList>()->message(),
                     DetailAction(action) == DetailAction::TagList
                         ? I18n::label(15)
                         : ScreenTexts::question(ScreenTexts::NoComments));
        if (DetailAction(action) == DetailAction::TagList)
            mTv->press({DEVICE_DOWN_KEY, DEVICE_SELECT_KEY}); // the photo's owner alone adds one
        QVERIFY(!mTv->shown<QKeyBoardInput>());
        leavePhoto(2);
    }

    void postings_data()
    {
        QTest::addColumn<Behaviour>("behaviour");
        QTest::addColumn<int>("prompt");
        for (const Misbehaviour &bad : misbehaviours().mid(1)) // a time-out takes 40 s
            QTest::newRow(bad.name) << bad.behaviour << bad.prompt;
    }

    // What was typed is kept until the service has taken it.
    void postings()
    {
        QFETCH(Behaviour, behaviour);
        QFETCH(int, prompt);
        const QString words = QString("after ") + QTest::currentDataTag();
        spoil(behaviour, "POST", "/photoid/");
        openPhoto();
        runOnPhoto(DetailAction::AddComment);
        type(words);
        QTRY_COMPARE(mTv->toast(), I18n::prompt(prompt));
        QVERIFY(!mTv->shown<SendingNotice>());
        QCOMPARE(mTv->shown<QKeyBoardInput>()->text(), words);
        heal();
        mTv->press(DEVICE_SELECT_KEY); // Enter has the focus still
        QTRY_COMPARE(mTv->toast(), I18n::prompt(7));
        QVERIFY(!mTv->shown<QKeyBoardInput>());
        leavePhoto(1);
    }

    void sendingIsGivenUp()
    {
        spoil(MisbehavingServer::silence(), "POST", "/photoid/");
        openPhoto();
        runOnPhoto(DetailAction::AddComment);
        QTimer poll;
        connect(&poll, &QTimer::timeout, this, [this] {
            if (mTv->shown<SendingNotice>())
                mTv->press({DEVICE_SELECT_KEY, DEVICE_RETURN_KEY});
        });
        poll.start(1);
        type("never");
        poll.stop();
        QVERIFY(!mTv->shown<SendingNotice>());
        QCOMPARE(mTv->shown<QKeyBoardInput>()->text(), QStringLiteral("never"));
        leavePhoto(2);
    }

    // Of a comment that the service says to have deleted, and goes on listing.
    void deletionIsRefused()
    {
        openPhoto();
        runOnPhoto(DetailAction::AddComment);
        type("here to stay");
        QTRY_VERIFY(!mTv->shown<QKeyBoardInput>());
        mTv->press({DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY});
        QVERIFY(mTv->shown<NoteList>());
        QTRY_VERIFY(mTv->shown<NoteList>()->count() > 0);
        const int count = mTv->shown<NoteList>()->count();
        spoil(MisbehavingServer::answer({}), "DELETE", "/photoid/");
        mTv->press({DEVICE_DOWN_KEY, DEVICE_SELECT_KEY, DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY}); // no
        QVERIFY(!mTv->shown<QPopupDialog>());
        QVERIFY(mRelay->requests().last().method != "DELETE");
        mTv->press({DEVICE_SELECT_KEY, DEVICE_SELECT_KEY});
        QTRY_COMPARE(mTv->toast(), ScreenTexts::question(ScreenTexts::CommentNotDeleted));
        QCOMPARE(mTv->shown<NoteList>()->count(), count);
        leavePhoto(2);
    }

    void missingPictures()
    {
        spoil(MisbehavingServer::answer("\xff\xd8\xff no photo"), "GET", "/photos/");
        PhotoManager::clearAll();
        mTv->press(DEVICE_PAGEDOWN_KEY);
        QTRY_COMPARE(mTv->captions().size(), photos - 8);
        QTRY_VERIFY(Download::mHomeLabelUrlHash.isEmpty());
        QVERIFY(!mTv->showsColours(mColours));
        heal();
        // The keys go on working, and the pictures can be had again.
        for (int key : {DEVICE_PAGEUP_KEY, DEVICE_PAGEDOWN_KEY}) {
            mTv->press(key);
            QTRY_VERIFY(mTv->showsColours(mColours));
        }
    }

    void theServiceIsGone()
    {
        mTv.reset();
        mTv = std::make_unique<Television>();
        signIn(mService.url());
        mService.kill();
        enter(UpWidget::MyPhotosEntry);
        expectFailure(ScreenTexts::NoConnection);
        QVERIFY(mService.start());
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_COMPARE(mTv->captions().size(), 1);
    }

private:
    // Every request that begins with the method and has this in its address is answered like that.
    void spoil(const Behaviour &behaviour, const QByteArray &method, const QByteArray &address)
    {
        const Behaviour good = forwardTo(mService.port());
        mRelay->otherwise([=](QTcpSocket *client, const Request &request) {
            const bool isBad = request.method == method && request.path.contains(address);
            (isBad ? behaviour : good)(client, request);
        });
    }

    void heal() { mRelay->otherwise(forwardTo(mService.port())); }

    void forgetAll()
    {
        PackageManager::clearAll();
        PhotoManager::clearAll();
    }

    void openPhoto()
    {
        mTv->press(DEVICE_SELECT_KEY);
        QVERIFY(mTv->shown<DetailStage>());
    }

    // The page says why, and the question after a page refused is answered: not back to the
    // accounts.
    void expectFailure(int failure)
    {
        QTRY_COMPARE(mTv->failure(), ScreenTexts::failure(failure));
        if (mTv->focus() != QLatin1String("FailurePage"))
            mTv->press({DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY});
        QTRY_COMPARE(mTv->focus(), QStringLiteral("FailurePage"));
    }

    // From as many steps inside of it, to the first cell.
    void leavePhoto(int steps)
    {
        for (int i = 0; i < steps; ++i)
            mTv->press(DEVICE_RETURN_KEY);
        QTRY_COMPARE(mTv->focus(), mTv->captions().value(0));
    }

    std::unique_ptr<MisbehavingServer> mRelay;
};

int main(int argc, char *argv[])
{
    TestBadService test;
    return RemoteCase::run(test, argc, argv);
}
#include "tst_badservice.moc"
