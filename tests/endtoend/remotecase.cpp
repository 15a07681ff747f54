#include "endtoend/remotecase.h"

#include "app/mainapplication.h"
#include "common/keyrobot.h"
#include "common/ui/qpopupform.h"
#include "common/ui/scale.h"
#include "network/systemconfig.h"
#include "res/resources.h"
#include "ui/picturedetailwidget.h"
#include "ui/upwidget.h"

namespace {

constexpr int mostPages = 20;
constexpr int perPage = 8;

} // namespace

const QString RemoteCase::anna = QStringLiteral("anna@orvala.example");
const QString RemoteCase::ben = QStringLiteral("ben@orvala.example");
const QString RemoteCase::carl = QStringLiteral("carl@orvala.example");

int RemoteCase::run(RemoteCase &test, int argc, char **argv)
{
    const QTemporaryDir folder;
    if (const QString scale = qEnvironmentVariable("TEST_SCALE"); !scale.isEmpty()) {
        QSettings settings(folder.filePath("config.ini"), QSettings::IniFormat);
        settings.setValue("Layout/Scale", scale);
        settings.sync();
        SystemConfig::setConfigFile(settings.fileName());
    }
    prepareScale();
    MainApplication application(argc, argv);
    applyScale();
    initResources();
    return QTest::qExec(&test, argc, argv);
}

void RemoteCase::addPhotos(const QString &folder, const QString &name, int count)
{
    for (int i = 1; i <= count; ++i) {
        const QString caption = name + ' ' + QString::number(i);
        const QColor colour = QColor::fromHsv(mColours.size() * 17 % 360, 255, 200);
        mColours.insert(caption, colour);
        QVERIFY(mService.addPhoto(folder + '/' + caption + ".jpg", colour, {400, 300}));
    }
}

void RemoteCase::addPeople()
{
    for (const char *name : {"Anna", "Ben", "Carl"})
        QVERIFY(mService.addUser(QString(name).toLower() + "@orvala.example", name,
                                 QString(name).toLower()));
}

void RemoteCase::switchOn()
{
    QVERIFY(mService.start());
    QVERIFY(mService.waitForPhotos(mColours.size()));
    mTv = std::make_unique<Television>();
}

void RemoteCase::switchOff()
{
    mTv.reset();
    mService.kill();
}

void RemoteCase::signIn(const QString &origin)
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
    QTRY_VERIFY(isListed(QStringLiteral("1/%1").arg(mColours.size()), perPage));
    QCOMPARE(mTv->focus(), mTv->captions().first());
}

void RemoteCase::enter(int entry)
{
    QVERIFY(mTv->enter(entry));
}

void RemoteCase::walkTo(const QString &caption)
{
    for (int i = 0; i < mostPages * perPage && !mTv->focus().startsWith(caption); ++i) {
        mTv->press(DEVICE_RIGHT_KEY);
        QTRY_VERIFY(!mTv->isLoading());
    }
    QVERIFY2(mTv->focus().startsWith(caption), qPrintable(mTv->focus()));
}

void RemoteCase::type(const QString &text)
{
    KeyRobot robot(mTv->shown<QPopUpForm>());
    QVERIFY(robot.box());
    for (uint character : text.toUcs4()) {
        const QString letter = QString::fromUcs4(&character, 1);
        if (!robot.type(letter))
            pressKey(robot.box(), 0, letter); // as a keyboard at the device has it
    }
    robot.press(EnterKey);
}

void RemoteCase::runOnPhoto(DetailAction action)
{
    const auto actions = detailActions(mTv->shown<PictureDetailWidget>()->isSelfPhoto());
    mTv->press(DEVICE_DOWN_KEY);
    mTv->press(QList<int>::fromVector(QVector<int>(actions.size(), DEVICE_LEFT_KEY)));
    mTv->press(QList<int>::fromVector(QVector<int>(actions.indexOf(action), DEVICE_RIGHT_KEY)));
    mTv->press(DEVICE_SELECT_KEY);
}

bool RemoteCase::isListed(const QString &position, int cells) const
{
    return mTv->position() == position && mTv->captions().size() == cells &&
           mTv->showsColours(mColours);
}
