#include "platform/linknotify.h"

#include <QElapsedTimer>
#include <QProcess>
#include <QSemaphore>
#include <QTest>

#include <net/if.h>
#include <sched.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <unistd.h>

#include <atomic>
#include <cstring>
#include <fstream>
#include <mutex>

namespace {

struct Call
{
    QString name;
    bool carrier;
};

std::mutex callsMutex;
QList<Call> allCalls;
QSemaphore gate; // taken by each call while it is closed
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

QList<Call> calls()
{
    const std::lock_guard<std::mutex> lock(callsMutex);
    return allCalls;
}

QList<bool> carriersOf(const QString &name)
{
    QList<bool> carriers;
    for (const Call &call : calls()) {
        if (call.name == name)
            carriers.append(call.carrier);
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

void change(const char *name, unsigned long get, unsigned long set, void (*edit)(ifreq *, int),
            int value)
{
    const int fd = ::socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0);
    ifreq request = {};
    std::strncpy(request.ifr_name, name, IFNAMSIZ - 1);
    QVERIFY(::ioctl(fd, get, &request) == 0);
    edit(&request, value);
    QVERIFY(::ioctl(fd, set, &request) == 0);
    ::close(fd);
}

void setUp(const char *name, bool up)
{
    const auto edit = [](ifreq *request, int value) {
        request->ifr_flags =
            short(value ? request->ifr_flags | IFF_UP : request->ifr_flags & ~IFF_UP);
    };
    change(name, SIOCGIFFLAGS, SIOCSIFFLAGS, edit, up);
}

void setMtu(const char *name, int mtu)
{
    change(
        name, SIOCGIFMTU, SIOCSIFMTU, [](ifreq *request, int value) { request->ifr_mtu = value; },
        mtu);
}

bool ip(const QString &arguments)
{
    return QProcess::execute(QStringLiteral("ip"),
                             arguments.split(QLatin1Char(' '), Qt::SkipEmptyParts)) == 0;
}

// Both ends up, so that both have a carrier.
void addCable(const char *name, const char *otherEnd)
{
    QVERIFY(ip(QStringLiteral("link add %1 type veth peer name %2")
                   .arg(QLatin1String(name), QLatin1String(otherEnd))));
    setUp(otherEnd, true);
    setUp(name, true);
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
        addCable("first", "firstEnd");
        addCable("second", "secondEnd");
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
        for (int i = 0; i < 50; ++i) {
            setUp("first", false);
            setUp("first", true);
            setUp("lo", i % 2 == 0);
        }
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
        addCable("visitor", "visitorEnd");
        QTRY_COMPARE(carriersOf("visitor"), QList<bool>({true}));
        QTRY_COMPARE(carriersOf("visitorEnd"), QList<bool>({true}));
        QVERIFY(ip(QStringLiteral("link del visitor")));
        QTRY_COMPARE(carriersOf("visitor"), QList<bool>({true, false}));
        QTRY_COMPARE(carriersOf("visitorEnd"), QList<bool>({true, false}));
    }

    void recoversFromLostNotices()
    {
        gateClosed = true;
        setUp("second", false);
        QTRY_VERIFY(!calls().isEmpty());
        // The thread stands still: more notices than its socket can hold, the last ones of
        // interest.
        for (int i = 0; i < 3000; ++i)
            setMtu("first", 1400 + i % 2);
        setUp("first", false);
        setUp("second", true);
        gateClosed = false;
        gate.release();
        QTRY_COMPARE(carriersOf("first"), QList<bool>({false}));
        QTRY_COMPARE(carriersOf("second"), QList<bool>({false, true}));
        setUp("first", true);
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
