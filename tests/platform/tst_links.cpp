#include "platform/linknotify.h"

#include <QElapsedTimer>
#include <QProcess>
#include <QSemaphore>
#include <QTest>

#include <sched.h>
#include <unistd.h>

#include <atomic>
#include <fstream>
#include <mutex>

namespace {

std::mutex callsMutex;
QList<QPair<QString, bool>> allCalls; // name and carrier
QSemaphore gate;                      // taken by each call while it is closed
std::atomic<bool> gateClosed{false};

int note(char *name, _NETWORK_EVENT_T event)
{
    {
        const std::lock_guard<std::mutex> lock(callsMutex);
        allCalls.append({QString::fromLatin1(name), event != NETWORK_EVENT_PLUG_OUT});
    }
    if (gateClosed)
        gate.acquire();
    return 0;
}

QList<bool> carriersOf(const QString &name)
{
    const std::lock_guard<std::mutex> lock(callsMutex);
    QList<bool> carriers;
    for (const auto &[called, carrier] : qAsConst(allCalls)) {
        if (called == name)
            carriers.append(carrier);
    }
    return carriers;
}

bool alternates(const QList<bool> &carriers)
{
    for (int i = 1; i < carriers.size(); ++i) {
        if (carriers[i] == carriers[i - 1])
            return false;
    }
    return true;
}

// Commands of the program ip, one a line.
bool ip(const QString &lines)
{
    QProcess process;
    process.start(QStringLiteral("ip"), {"-batch", "-"});
    process.write(lines.toLatin1());
    process.closeWriteChannel();
    return process.waitForFinished() && process.exitCode() == 0;
}

// Both ends up, so that both have a carrier.
bool addCable(const QString &name)
{
    return ip(QStringLiteral("link add %1 type veth peer name %1End\nlink set %1End up\n"
                             "link set %1 up\n")
                  .arg(name));
}

// Moves the process into a network of its own, as root or as the root of a user namespace, so that
// no real interface is ever touched.
bool enterOwnNetwork()
{
    const uid_t user = ::getuid();
    if (::unshare(user == 0 ? CLONE_NEWNET : CLONE_NEWUSER | CLONE_NEWNET) != 0)
        return false;
    if (user != 0)
        std::ofstream("/proc/self/uid_map") << "0 " << user << " 1";
    return true;
}

bool hasOwnNetwork = false;

} // namespace

// Real interfaces, in a network namespace of the test's own.
class TestLinks : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase()
    {
        QVERIFY2(hasOwnNetwork, "this test needs the right to make a network namespace");
        QVERIFY(addCable("first"));
        QVERIFY(addCable("second"));
    }

    void init()
    {
        QCOMPARE(i4_reg_network_notify_cb(nullptr), 0);
        const std::lock_guard<std::mutex> lock(callsMutex);
        allCalls.clear();
        QCOMPARE(i4_reg_network_notify_cb(note), 0);
    }

    void cleanup()
    {
        QElapsedTimer timer;
        timer.start();
        QCOMPARE(i4_reg_network_notify_cb(nullptr), 0);
        QVERIFY(timer.elapsed() < 500);
    }

    void tellsOfEveryFlap()
    {
        QVERIFY(ip(QString("link set first down\nlink set first up\nlink set lo up\n"
                           "link set lo down\n")
                       .repeated(50)));
        QTRY_COMPARE(carriersOf("first").size(), 100);
        QVERIFY(carriersOf("lo").isEmpty());
        QCOMPARE(carriersOf("first").first(), false);
        QVERIFY(alternates(carriersOf("first")));
        // The kernel may merge what the other end sees, but it ends where it began.
        QTRY_VERIFY(carriersOf("firstEnd").isEmpty() || carriersOf("firstEnd").last());
        QVERIFY(alternates(carriersOf("firstEnd")));
    }

    void tellsOfInterfacesThatComeAndGo()
    {
        QVERIFY(addCable("visitor"));
        QTRY_COMPARE(carriersOf("visitor"), QList<bool>({true}));
        QTRY_COMPARE(carriersOf("visitorEnd"), QList<bool>({true}));
        QVERIFY(ip("link del visitor\n"));
        QTRY_COMPARE(carriersOf("visitor"), QList<bool>({true, false}));
        QTRY_COMPARE(carriersOf("visitorEnd"), QList<bool>({true, false}));
    }

    void recoversFromLostNotices()
    {
        gateClosed = true;
        ip("link set second down\n");
        QTRY_VERIFY(!carriersOf("second").isEmpty());
        // The thread stands still: more notices than its socket can hold, the last ones count.
        const bool isDone =
            ip(QString("link set first mtu 1400\nlink set first mtu 1401\n").repeated(1500) +
               "link set first down\nlink set second up\n");
        gateClosed = false;
        gate.release();
        QVERIFY(isDone);
        QTRY_COMPARE(carriersOf("first"), QList<bool>({false}));
        QTRY_COMPARE(carriersOf("second"), QList<bool>({false, true}));
        QVERIFY(ip("link set first up\n"));
        QTRY_COMPARE(carriersOf("first"), QList<bool>({false, true}));
    }
};

int main(int argc, char *argv[])
{
    // Before any thread is there: a thread keeps the network that it was made in.
    hasOwnNetwork = enterOwnNetwork();
    QCoreApplication application(argc, argv);
    TestLinks test;
    return QTest::qExec(&test, argc, argv);
}
#include "tst_links.moc"
