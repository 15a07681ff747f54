#include "app/mainapplication.h"
#include "app/mainwidget.h"
#include "common/ui/qpopupdialog.h"
#include "common/ui/remotekeys.h"
#include "platform/devicestate.h"
#include "platform/ipc.h"
#include "platform/ipcthread.h"
#include "support/logcapture.h"
#include "support/testconfig.h"

#include <QKeyEvent>
#include <QLabel>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QTest>
#include <QTimer>

#include <memory>
#include <thread>

namespace {

// Notes the keys that reach it.
class KeyWidget : public QWidget
{
public:
    using QWidget::QWidget;
    QList<int> keys;

protected:
    void keyPressEvent(QKeyEvent *event) override { keys.append(event->key()); }
};

bool press(QObject *receiver, int key)
{
    QKeyEvent event(QEvent::KeyPress, key, Qt::NoModifier);
    return QCoreApplication::sendEvent(receiver, &event);
}

} // namespace

class TestApp : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase()
    {
        mConfig.write("[DBPath]\nDBPath=" + mFolder.filePath("accounts.db").toUtf8());
        netcommon::Ipc::setSocketPath(mFolder.filePath("no-shell").toStdString());
    }

    void init()
    {
        mMain = std::make_unique<MainWidget>();
        mMain->resize(1280, 720);
        mMain->show();
    }

    void cleanup() { mMain.reset(); }

    void routesKeysToTheDialog()
    {
        KeyWidget receiver;
        auto dialog = std::make_unique<KeyWidget>();
        QVERIFY(!press(&receiver, DEVICE_UP_KEY)); // taken, and yet reported as not
        MainApplication::setDialog(dialog.get(), true);
        QVERIFY(press(&receiver, DEVICE_DOWN_KEY));
        QVERIFY(press(dialog.get(), DEVICE_LEFT_KEY));
        MainApplication::setDialog(dialog.get(), false);
        press(&receiver, DEVICE_RIGHT_KEY);
        QCOMPARE(dialog->keys, QList<int>({DEVICE_DOWN_KEY, DEVICE_LEFT_KEY}));
        QCOMPARE(receiver.keys, QList<int>({DEVICE_UP_KEY, DEVICE_RIGHT_KEY}));
    }

    void leavesOnlyForTheShell()
    {
        QSignalSpy answers(mMain.get(), &MainWidget::signalResponseParent);
        bool stayed = false;
        QTimer::singleShot(0, mMain.get(), [&] { mMain->exitOrvala(false, true); });
        QTimer::singleShot(1, mMain.get(), [&] {
            stayed = answers.isEmpty();
            mMain->exitOrvala(true, false);
        });
        QCOMPARE(QApplication::exec(), 0);
        QVERIFY(stayed);
        QCOMPARE(answers.value(0), QVariantList({2}));
    }

    void tellsOfTheCable()
    {
        char name[] = "eth0";
        const LogCapture log;
        for (int event : {1, 0, 1, 2}) {
            std::thread([&name, event] {
                MainWidget::NetworkStatusNotify(name, _NETWORK_EVENT_T(event));
            }).join();
            QTRY_COMPARE(NetworkCableStatus, event != 1);
        }
        QCOMPARE(log.lines().count("Notifycation: Network cable eth0 has plug out.\n"), 2);
        QCOMPARE(log.lines().count("Notifycation: Network cable eth0 has plug in.\n"), 2);
    }

    void replacesTheStatusDialog()
    {
        const auto shows = [this](const QString &text) {
            for (const QLabel *label : dialogs().first()->findChildren<QLabel *>()) {
                if (label->text() == text)
                    return true;
            }
            return false;
        };
        mMain->handleCableStatusChange(false);
        QVERIFY(shows(QStringLiteral("Error")));
        mMain->handleCableStatusChange(true);
        QCOMPARE(dialogs().size(), 1);
        QVERIFY(shows(QStringLiteral("Notification")));
        QVERIFY(dialogs().first()->isVisible());
        press(mMain.get(), DEVICE_SELECT_KEY);
        QVERIFY(dialogs().isEmpty());
    }

private:
    QList<QPopupDialog *> dialogs() const { return mMain->findChildren<QPopupDialog *>(); }

    TestConfig mConfig;
    QTemporaryDir mFolder;
    std::unique_ptr<MainWidget> mMain;
};

int main(int argc, char *argv[])
{
    MainApplication application(argc, argv);
    TestApp test;
    const int result = QTest::qExec(&test, argc, argv);
    delete netcommon::IpcThread::getInstance();
    delete netcommon::Ipc::getInstance();
    return result;
}
#include "tst_app.moc"
