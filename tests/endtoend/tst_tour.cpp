#include "base/i18n.h"
#include "common/ui/qconfirm.h"
#include "common/ui/qpopupdialog.h"
#include "common/ui/qpopupform.h"
#include "common/ui/remotekeys.h"
#include "data/download.h"
#include "data/mediauploader.h"
#include "data/packagemanager.h"
#include "endtoend/remotecase.h"
#include "platform/ipc.h"
#include "ui/detailinformation.h"
#include "ui/detailstage.h"
#include "ui/homewidget.h"
#include "ui/notelist.h"
#include "ui/picturedetailwidget.h"
#include "ui/screentexts.h"
#include "ui/searchwidget.h"
#include "ui/upwidget.h"

namespace {

const QString party = QString::fromUtf8("Party \U0001F389");
const QString comment = QString::fromUtf8("7 < 8 & \"žluť\" \U0001F3D4 so");
const QString tag = QStringLiteral("a/b?c#d%20");
constexpr int seaPhotos = 10, gulls = 104;

} // namespace

// All of browsing, from the sign-in to the sign-out, by keys alone: each step goes on where the
// one before it has left the screen, and finds its way back to where it came from.
class TestTour : public RemoteCase
{
    Q_OBJECT

private slots:
    void initTestCase()
    {
        addPhotos("anna/Sea", "Wave", seaPhotos);
        for (int i = 1; i <= 8; ++i)
            addPhotos("anna/Day " + QString::number(i), "Day " + QString::number(i), 1);
        addPhotos("ben/Party", party, 5);
        addPhotos("ben/Harbour", "Gull", gulls);
        addPhotos("carl/Town", "Square", 2);
        addPeople();
        switchOn();
    }

    void tour()
    {
        signIn(mService.url());
        for (auto step : {&TestTour::walkFeatured, &TestTour::openOwnAlbum, &TestTour::walkPhotos,
                          &TestTour::postComment, &TestTour::changeTags, &TestTour::deleteComment,
                          &TestTour::leaveAlbum, &TestTour::findUpload, &TestTour::search,
                          &TestTour::crossBlocks, &TestTour::visitPerson, &TestTour::signOut,
                          &TestTour::leave}) {
            if (QTest::currentTestFailed())
                return;
            (this->*step)();
        }
    }

    void cleanupTestCase() { switchOff(); }

private:
    void walkFeatured()
    {
        const int photos = mColours.size();
        const auto at = [photos](int number) {
            return QStringLiteral("%1/%2").arg(number).arg(photos);
        };
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
    }

    // The ninth of nine albums, which is on a page of its own.
    void openOwnAlbum()
    {
        enter(UpWidget::MyPhotosEntry);
        QTRY_COMPARE(mTv->captions().size(), 8);
        walkTo("Sea\n10 photos");
        mAlbum = mTv->position();
        QVERIFY(mAlbum.endsWith("/9"));
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_VERIFY(isListed("1/10", 8));
    }

    void walkPhotos()
    {
        walkTo("Wave 8");
        const int number = mTv->position().section('/', 0, 0).toInt();
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_VERIFY(isPhotoShown(number));
        for (int i = number; i < seaPhotos; ++i)
            mTv->press(DEVICE_NEXT_KEY);
        QTRY_VERIFY(isPhotoShown(seaPhotos));
        mTv->press({DEVICE_RIGHT_KEY, DEVICE_LEFT_KEY});
        QTRY_VERIFY(isPhotoShown(seaPhotos - 1));
    }

    void postComment()
    {
        runOnPhoto(DetailAction::AddComment);
        type(comment);
        QTRY_COMPARE(mTv->toast(), I18n::prompt(7));
        QTRY_VERIFY(information().contains(comment));
        QVERIFY(!mTv->shown<QPopUpForm>());
    }

    void changeTags()
    {
        runOnPhoto(DetailAction::AddTag);
        type(tag);
        QTRY_COMPARE(mTv->toast(), I18n::prompt(7));
        QTRY_VERIFY(information().contains(tag));
        runOnPhoto(DetailAction::TagList);
        QVERIFY(mTv->shown<NoteList>());
        QTRY_COMPARE(mTv->shown<NoteList>()->count(), 1);
        mTv->press({DEVICE_DOWN_KEY, DEVICE_SELECT_KEY});
        QVERIFY(mTv->shown<QConfirm>());
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_COMPARE(mTv->toast(), I18n::prompt(9));
        QTRY_COMPARE(mTv->shown<NoteList>()->message(), I18n::label(15));
        mTv->press(DEVICE_RETURN_KEY);
        QTRY_VERIFY(!information().contains(tag));
    }

    void deleteComment()
    {
        runOnPhoto(DetailAction::AllComments);
        QTRY_COMPARE(mTv->shown<NoteList>()->count(), 1);
        mTv->press({DEVICE_DOWN_KEY, DEVICE_SELECT_KEY});
        QVERIFY(mTv->shown<QPopupDialog>());
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_COMPARE(mTv->toast(), ScreenTexts::question(ScreenTexts::CommentDeleted));
        mTv->press(DEVICE_RETURN_KEY);
        QTRY_VERIFY(!information().contains(comment));
    }

    void leaveAlbum()
    {
        const QString title = detail()->photo().title;
        mTv->press(DEVICE_RETURN_KEY);
        QTRY_VERIFY(isListed("9/10", 2));
        QCOMPARE(mTv->focus(), title);
        mTv->press(DEVICE_RETURN_KEY);
        QTRY_COMPARE(mTv->position(), mAlbum);
        QCOMPARE(mTv->focus(), QStringLiteral("Sea\n10 photos"));
        mTv->press(DEVICE_RETURN_KEY);
        QVERIFY(mTv->shown<QConfirm>());
        mTv->press(DEVICE_RETURN_KEY);
        QCOMPARE(mTv->focus(), QStringLiteral("Sea\n10 photos"));
    }

    // What came from elsewhere is in the album when that is opened the next time.
    void findUpload()
    {
        const QString file = QDir(QDir::tempPath()).filePath("orvala-upload.png");
        QImage picture(400, 300, QImage::Format_RGB32);
        picture.fill(Qt::magenta);
        QVERIFY(picture.save(file));
        const QString title = QString::fromUtf8("<b> & \"\u044f\U0001F41F\" %1");
        mColours.insert(title, Qt::magenta);
        const QString album =
            mTv->shown<HomeWidget>()->findChild<PictureDetailWidget *>()->photo().albumId;
        QCOMPARE(MediaUploader::startToUpload(file, title, "default", album, "", false),
                 NET_SUCCESS);
        QVERIFY(QFile::remove(file));
        PackageManager::clearAll(); // as after a minute
        enter(UpWidget::MyPhotosEntry);
        QTRY_COMPARE(mTv->captions().size(), 8);
        walkTo("Sea\n11 photos");
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_VERIFY(isListed("1/11", 8));
        mTv->press(DEVICE_PAGEDOWN_KEY);
        QTRY_VERIFY(isListed("9/11", 3));
        QVERIFY(mTv->captions().contains(title));
    }

    void search()
    {
        enter(UpWidget::SearchEntry);
        mTv->press(DEVICE_SELECT_KEY);
        type("gull");
        QTRY_VERIFY(!mTv->shown<QPopUpForm>());
        mTv->press({DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY});
        QTRY_VERIFY(isListed("1/100", 8));
        for (int page = 2; page <= 13; ++page) {
            mTv->press(DEVICE_PAGEDOWN_KEY);
            QTRY_VERIFY(isListed(QStringLiteral("%1/100").arg(page * 8 - 7), page < 13 ? 8 : 4));
        }
    }

    // From the first hundred results to the second on the photo screen, to the slide show and back,
    // in the list, and back to the words.
    void crossBlocks()
    {
        mTv->press({DEVICE_RIGHT_KEY, DEVICE_RIGHT_KEY, DEVICE_RIGHT_KEY});
        const QString last = mTv->focus();
        mTv->press({DEVICE_SELECT_KEY, DEVICE_RIGHT_KEY});
        QTRY_VERIFY(isPhotoShown(101));
        const QString url = detail()->photo().imageUrl;
        mTv->press(DEVICE_SELECT_KEY);
        QCOMPARE(Download::mCurrentSlideShowImageUrl, url);
        mTv->press(DEVICE_RETURN_KEY);
        QTRY_VERIFY(isPhotoShown(101));
        mTv->press(DEVICE_LEFT_KEY);
        QTRY_VERIFY(isPhotoShown(100));
        mTv->press(DEVICE_RETURN_KEY);
        QTRY_VERIFY(isListed("100/100", 4));
        QCOMPARE(mTv->focus(), last);
        mTv->press(DEVICE_PAGEDOWN_KEY);
        QTRY_VERIFY(isListed("1/4", 4));
        mTv->press(DEVICE_RETURN_KEY);
        QTRY_VERIFY(mTv->shown<SearchWidget>());
        QCOMPARE(mTv->focus(), QStringLiteral("SearchWidget"));
        QCOMPARE(mTv->shown<SearchWidget>()->text(), QStringLiteral("gull"));
    }

    void visitPerson()
    {
        enter(UpWidget::FavoritesEntry);
        QTRY_COMPARE(mTv->captions().size(), 2);
        walkTo("Carl");
        const QString person = mTv->focus();
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_COMPARE(mTv->captions(), QStringList("Town\n2 photos"));
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_VERIFY(isListed("1/2", 2));
        mTv->press({DEVICE_RIGHT_KEY, DEVICE_RETURN_KEY});
        QTRY_COMPARE(mTv->focus(), QStringLiteral("Town\n2 photos"));
        mTv->press(DEVICE_RETURN_KEY);
        QTRY_COMPARE(mTv->captions().size(), 2);
        QTRY_COMPARE(mTv->focus(), person);
    }

    void signOut()
    {
        enter(UpWidget::SignOutEntry);
        QVERIFY(mTv->shown<QConfirm>());
        mTv->press(DEVICE_RETURN_KEY);
        QCOMPARE(mTv->menuEntry(), int(UpWidget::FavoritesEntry));
        enter(UpWidget::SignOutEntry);
        mTv->press(DEVICE_SELECT_KEY);
        QTRY_VERIFY(!mTv->home());
        QVERIFY(mTv->accounts().contains(anna));
        QTRY_VERIFY(mTv->accounts().contains(mTv->focus()));
    }

    // Exit: the shell is asked, agrees, and hears that the program leaves.
    void leave()
    {
        mTv->press(DEVICE_EXIT_KEY);
        const auto request = mTv->shell().next();
        QVERIFY(request && request->type == netcommon::MSG_REQUEST_EXIT);
        QVERIFY(mTv->shell().send(netcommon::MSG_EXIT, 1));
        QCOMPARE(QApplication::exec(), 0);
        const auto answer = mTv->shell().next();
        QVERIFY(answer && answer->type == netcommon::MSG_RESPONSE);
        QCOMPARE(answer->params[0], 2);
    }

    // On the photo screen.
    PictureDetailWidget *detail() const { return mTv->shown<PictureDetailWidget>(); }

    bool isPhotoShown(int number) const
    {
        const auto *stage = mTv->shown<DetailStage>();
        return stage && detail()->number() == number && !stage->isWaiting() &&
               stage->message().isEmpty() && !stage->picture().isNull() &&
               information().contains(detail()->photo().title);
    }

    QString information() const
    {
        return mTv->shown<DetailInformation>()->texts().join(' ').simplified();
    }

    QString mAlbum;
};

int main(int argc, char *argv[])
{
    TestTour test;
    return RemoteCase::run(test, argc, argv);
}
#include "tst_tour.moc"
