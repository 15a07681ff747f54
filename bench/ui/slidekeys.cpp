// A step of the slide show on an X screen, from the key to the last of the screen's corners having
// changed, against feh with the same photos: slidekeys OURS, the program that shows ours. Each is
// left alone between the steps, so that it can prepare the next photo if it does so.

#include "benchpicture.h"
#include "support/bench.h"

#include <QColor>
#include <QDeadlineTimer>
#include <QPainter>
#include <QProcess>
#include <QStandardPaths>
#include <QTemporaryDir>
#include <QThread>
#include <QVector>

#include <X11/Xlib.h>
#include <X11/Xutil.h>
#include <X11/keysym.h>

namespace {

constexpr int kPhotos = 24;
constexpr int kSteps = 20;
constexpr int kPauseMs = 700;
constexpr int kPatienceMs = 10000;
constexpr int kDifference = 40; // of a colour's part

class XScreen
{
public:
    XScreen()
        : mDisplay(XOpenDisplay(nullptr))
    {
        if (!mDisplay)
            qFatal("no X screen");
        mRoot = DefaultRootWindow(mDisplay);
        mSize = QSize(DisplayWidth(mDisplay, 0), DisplayHeight(mDisplay, 0));
    }
    ~XScreen() { XCloseDisplay(mDisplay); }

    QSize size() const { return mSize; }

    // Four corners of the middle nine tenths, and the centre.
    QVector<QColor> look() const
    {
        QVector<QColor> colours;
        for (const QPointF &at : {QPointF(0.05, 0.05), QPointF(0.95, 0.05), QPointF(0.5, 0.5),
                                  QPointF(0.05, 0.95), QPointF(0.95, 0.95)}) {
            XImage *pixel = XGetImage(mDisplay, mRoot, int(at.x() * mSize.width()),
                                      int(at.y() * mSize.height()), 1, 1, AllPlanes, ZPixmap);
            colours << QColor(QRgb(XGetPixel(pixel, 0, 0)));
            XDestroyImage(pixel);
        }
        return colours;
    }

    // The window that covers the screen; 0: none yet.
    Window program() const
    {
        Window root = 0, parent = 0, *windows = nullptr, found = 0;
        unsigned count = 0;
        XQueryTree(mDisplay, mRoot, &root, &parent, &windows, &count);
        for (unsigned i = 0; i < count; ++i) {
            XWindowAttributes is = {};
            XGetWindowAttributes(mDisplay, windows[i], &is);
            if (is.map_state == IsViewable && is.width >= mSize.width())
                found = windows[i];
        }
        XFree(windows);
        return found;
    }

    void press(Window window, KeySym key) const
    {
        XKeyEvent event = {};
        event.display = mDisplay;
        event.window = window;
        event.root = mRoot;
        event.same_screen = True;
        event.keycode = XKeysymToKeycode(mDisplay, key);
        for (int type : {KeyPress, KeyRelease}) {
            event.type = type;
            XSendEvent(mDisplay, window, True, KeyPressMask, reinterpret_cast<XEvent *>(&event));
        }
        XSync(mDisplay, False);
    }

private:
    Display *mDisplay;
    Window mRoot = 0;
    QSize mSize;
};

bool isOther(const QColor &one, const QColor &other)
{
    return qAbs(one.red() - other.red()) + qAbs(one.green() - other.green()) +
               qAbs(one.blue() - other.blue()) >
           kDifference;
}

bool isAllOther(const QVector<QColor> &before, const QVector<QColor> &now)
{
    for (int i = 0; i < before.size(); ++i) {
        if (!isOther(before.at(i), now.at(i)))
            return false;
    }
    return true;
}

// Blocks until the screen has not changed for a pause.
void waitUntilStill(const XScreen &screen)
{
    QDeadlineTimer still(kPauseMs), patience(kPatienceMs);
    QVector<QColor> shown = screen.look();
    while (!still.hasExpired() && !patience.hasExpired()) {
        QThread::msleep(10);
        const QVector<QColor> now = screen.look();
        if (now != shown)
            still = QDeadlineTimer(kPauseMs);
        shown = now;
    }
}

std::vector<double> stepTimes(const XScreen &screen, const QString &program,
                              const QStringList &arguments)
{
    QProcess process;
    process.setProcessChannelMode(QProcess::ForwardedErrorChannel);
    process.start(program, arguments);
    if (!process.waitForStarted())
        qFatal("%s does not start", qPrintable(program));
    for (QDeadlineTimer patience(kPatienceMs); !screen.program() && !patience.hasExpired();)
        QThread::msleep(20);
    waitUntilStill(screen);
    std::vector<double> times;
    for (int step = 0; step < kSteps; ++step) {
        const QVector<QColor> before = screen.look();
        const QDeadlineTimer patience(kPatienceMs);
        times.push_back(bench::seconds([&] {
            screen.press(screen.program(), XK_Right);
            while (!isAllOther(before, screen.look())) {
                if (patience.hasExpired())
                    qFatal("%s does not answer the key", qPrintable(program));
            }
        }));
        waitUntilStill(screen);
    }
    process.kill();
    process.waitForFinished();
    return times;
}

// Photos that differ everywhere from the one before: reddish and bluish in turn.
QStringList makePhotos(const QTemporaryDir &folder, const QSize &screen)
{
    const QImage photo =
        QImage::fromData(photoJpeg(screen.width() * 7 / 8, screen.height() * 7 / 8));
    QStringList files;
    for (int i = 0; i < kPhotos; ++i) {
        QImage tinted = photo.convertToFormat(QImage::Format_RGB32);
        QPainter painter(&tinted);
        painter.fillRect(tinted.rect(), i % 2 ? QColor(255, 0, 0, 150) : QColor(0, 0, 255, 150));
        painter.end();
        files << folder.filePath(QString::asprintf("%02d.jpg", i));
        tinted.save(files.last(), "jpg", 90);
    }
    return files;
}

} // namespace

int main(int argc, char **argv)
{
    if (argc < 2)
        return std::puts("slidekeys OURS"), 1;
    const char *what = "slide step to a prepared photo on an X screen against feh";
    const QString feh = QStandardPaths::findExecutable(QStringLiteral("feh"));
    if (feh.isEmpty())
        return std::printf("%s: feh is not installed\n", what), 0;
    const XScreen screen;
    const QTemporaryDir folder;
    const QStringList photos = makePhotos(folder, screen.size());
    const auto ours = stepTimes(screen, QString::fromLocal8Bit(argv[1]), photos);
    const auto theirs = stepTimes(
        screen, feh, QStringList{"--fullscreen", "--auto-zoom", "--hide-pointer"} + photos);
    const double a = bench::median(ours), b = bench::median(theirs);
    bench::row(what, a / b, 0.15,
               bench::milliseconds({0, a, b}) + ", " + std::to_string(screen.size().height()) +
                   "p");
    return 0;
}
