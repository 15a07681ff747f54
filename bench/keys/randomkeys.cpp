// Random keys of the remote over all screens of the whole program, with an album service that
// misbehaves: how long the event loop leaves the user without an answer, and whether the program
// lives through it.
//
//   randomkeys [KEYS [SEED]]

#include "app/mainapplication.h"
#include "common/ui/remotekeys.h"
#include "endtoend/albumservice.h"
#include "endtoend/television.h"
#include "keys/spoiltservice.h"
#include "paths.h"
#include "res/resources.h"
#include "support/bench.h"
#include "ui/homewidget.h"

#include <QElapsedTimer>
#include <QRandomGenerator>
#include <QTimer>

namespace {

constexpr int KEYS = 100000;
constexpr int KEYS_OF_A_ROUND = 500; // then the program is started anew, with its accounts back
constexpr int PAUSE_MS = 2;
constexpr double LONG_GAP = 0.2, LONGEST_GAP = 5; // seconds
constexpr double LONG_GAPS = 0.001;               // so many of all

const QString anna = QStringLiteral("anna@orvala.example");
const QString ben = QStringLiteral("ben@orvala.example");

// Each as often as it stands here: mostly those that lead from screen to screen. Without Exit,
// which ends the program soon.
const QVector<int> remote = {
    DEVICE_LEFT_KEY,     DEVICE_LEFT_KEY,   DEVICE_RIGHT_KEY,     DEVICE_RIGHT_KEY,
    DEVICE_RIGHT_KEY,    DEVICE_UP_KEY,     DEVICE_UP_KEY,        DEVICE_DOWN_KEY,
    DEVICE_DOWN_KEY,     DEVICE_DOWN_KEY,   DEVICE_SELECT_KEY,    DEVICE_SELECT_KEY,
    DEVICE_SELECT_KEY,   DEVICE_SELECT_KEY, DEVICE_SELECT_KEY,    DEVICE_RETURN_KEY,
    DEVICE_RETURN_KEY,   DEVICE_PLAY_KEY,   DEVICE_PLAYPAUSE_KEY, DEVICE_PAUSE_KEY,
    DEVICE_PRE_KEY,      DEVICE_NEXT_KEY,   DEVICE_PAGEUP_KEY,    DEVICE_PAGEDOWN_KEY,
    DEVICE_PAGEDOWN_KEY, DEVICE_RED_KEY,    DEVICE_SETTING_KEY,   DEVICE_CLEAR_KEY,
    MEDIA_CENTER_KEY,    Qt::Key_A};

// Presses keys, and notes how long it took until the event loop was ready for the next one. A
// request that blocks handles events meanwhile, and so keys.
class Presser : public QObject
{
public:
    explicit Presser(quint32 seed)
        : mRandom(seed)
    {
        mTimer.setSingleShot(true);
        mTimer.setTimerType(Qt::PreciseTimer);
        connect(&mTimer, &QTimer::timeout, this, &Presser::pressOne);
    }

    // Ends when so many keys have been pressed, or when the program has ended at the user's wish.
    // Returns the number of keys.
    int press(const Television &television, int keys)
    {
        mTelevision = &television;
        mLeft = keys;
        mSinceLast.start();
        mTimer.start(PAUSE_MS);
        QCoreApplication::exec();
        mTimer.stop();
        return keys - mLeft;
    }

    const std::vector<double> &gaps() const { return mGaps; }
    int lost() const { return mLost; }

private:
    void pressOne()
    {
        mGaps.push_back(double(std::max<qint64>(0, mSinceLast.restart() - PAUSE_MS)) / 1e3);
        if (mLeft == 0) {
            QCoreApplication::quit();
            return;
        }
        --mLeft;
        mTimer.start(PAUSE_MS); // before the key, which may end in an event loop of its own
        mLost += isLost();
        mTelevision->press(remote.at(mRandom.bounded(remote.size())));
    }

    // Nothing that is seen has the focus; while a page loads, nothing needs it.
    bool isLost() const
    {
        const QWidget *focused = QApplication::focusWidget();
        const HomeWidget *home = mTelevision->home();
        return (!focused || !focused->isVisible()) && !(home && home->isLoading());
    }

    QRandomGenerator mRandom;
    QTimer mTimer;
    QElapsedTimer mSinceLast;
    const Television *mTelevision = nullptr;
    int mLeft = 0;
    int mLost = 0;
    std::vector<double> mGaps;
};

void fill(AlbumService &service)
{
    bool isFilled = true;
    const auto add = [&](const QString &folder, int count) {
        for (int i = 1; i <= count; ++i)
            isFilled &= service.addPhoto(QStringLiteral("%1/Photo %2.jpg").arg(folder).arg(i),
                                         QColor::fromHsv(i * 17 % 360, 200, 200), {400, 300});
    };
    add("anna/Sea", 21);
    add("anna/Forest", 3);
    add("ben/Harbour", 110);
    isFilled &= service.addUser(anna, "Anna", "anna") && service.addUser(ben, "Ben", "ben");
    if (!isFilled || !service.start() || !service.waitForPhotos(134))
        qFatal("the album service does not start");
}

// One start of the program, in every second round with the list of accounts first. Returns the
// number of keys that were pressed.
int playRound(const AlbumService &service, SpoiltService &spoilt, Presser &presser, int round,
              int keys)
{
    Television television;
    television.useService(spoilt.url());
    television.set("Network/SilenceSeconds", 1);
    television.set("Network/PageSeconds", 2);
    television.set("Network/SignInSeconds", 2);
    television.set("Max/PageCacheSeconds", 1);
    if (!television.addAccount(anna, "Anna", service.tokens(anna)) ||
        !television.addAccount(ben, "Ben", service.tokens(ben)) || !television.switchOn())
        qFatal("the television does not start");
    if (round % 2 == 0)
        television.press(DEVICE_SELECT_KEY);
    // Whatever waits for an answer at the end gives up.
    QTimer release;
    QObject::connect(&release, &QTimer::timeout, &release, [&] { spoilt.closeConnections(); });
    release.start(10000);
    return presser.press(television, keys);
}

void report(const std::vector<double> &gaps, const QString &note)
{
    const auto isLong = [](double gap) { return gap >= LONG_GAP; };
    const double longGaps = double(std::count_if(gaps.begin(), gaps.end(), isLong));
    const double longest = *std::max_element(gaps.begin(), gaps.end());
    char text[160];
    std::snprintf(text, sizeof text, "%.0f of %zu gaps; %s", longGaps, gaps.size(),
                  qPrintable(note));
    bench::row("random keys: share of gaps of 0.2 s and more, against 0.1 %",
               longGaps / double(gaps.size()) / LONG_GAPS, 1, text);
    std::snprintf(text, sizeof text, "%.3f s", longest);
    bench::row("random keys: longest gap, against 5 s", longest / LONGEST_GAP, 1, text);
}

} // namespace

int main(int argc, char *argv[])
{
    qInstallMessageHandler([](QtMsgType type, const QMessageLogContext &, const QString &line) {
        if (type == QtFatalMsg)
            std::fprintf(stderr, "%s\n", qPrintable(line));
    });
    QCoreApplication::addLibraryPath(QStringLiteral(ORVALA_PLUGIN_DIR));
    qputenv("QT_QPA_PLATFORM", "offscreen");
    MainApplication application(argc, argv);
    QApplication::setQuitOnLastWindowClosed(false); // the next round opens another one
    initResources();
    const QStringList arguments = QCoreApplication::arguments();
    const int keys = arguments.value(1, QString::number(KEYS)).toInt();
    const quint32 seed = arguments.value(2, QStringLiteral("1")).toUInt();
    AlbumService service;
    fill(service);
    SpoiltService spoilt(service.port(), seed);
    Presser presser(seed);
    for (int round = 0, pressed = 0; pressed < keys; ++round)
        pressed +=
            playRound(service, spoilt, presser, round, std::min(KEYS_OF_A_ROUND, keys - pressed));
    report(presser.gaps(), QStringLiteral("0 crashes, %1 answers spoilt, %2 keys met no focus")
                               .arg(spoilt.spoilt())
                               .arg(presser.lost()));
    return 0;
}
