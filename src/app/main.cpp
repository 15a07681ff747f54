#include "app/exitdeadline.h"
#include "app/fontsetup.h"
#include "app/mainapplication.h"
#include "app/mainwidget.h"
#include "base/log.h"
#include "common/ui/scale.h"
#include "network/systemconfig.h"
#include "paths.h"
#include "platform/ipc.h"
#include "platform/ipcthread.h"
#include "res/resources.h"

#include <QCursor>
#include <QFontDatabase>
#include <QLocale>
#include <QPixmap>
#include <QScreen>
#include <QTextCodec>

#include <malloc.h>
#include <sys/prctl.h>
#include <unistd.h>

#include <clocale>
#include <cstdlib>

using netcommon::Ipc;
using netcommon::IpcThread;

namespace {

constexpr int LARGE_BLOCK = 128 * 1024; // bytes
constexpr useconds_t READY_POLL_MICROSECONDS = 150000;

// What must be settled before the application object exists.
void prepareProcess()
{
    // The memory holds tokens: no core dump, no debugger of another process.
    ::prctl(PR_SET_DUMPABLE, 0);
    // Pictures come and go in large blocks: each is mapped by itself and given back when it goes.
    ::mallopt(M_MMAP_THRESHOLD, LARGE_BLOCK);
    ::mallopt(M_TRIM_THRESHOLD, 2 * LARGE_BLOCK);
    // Without it the C library looks at the zone file anew for every local time.
    ::setenv("TZ", ":/etc/localtime", 0);
    // Nothing here is drawn with OpenGL; its libraries would cost half the start on X11.
    qputenv("QT_XCB_GL_INTEGRATION", "none");
    QCoreApplication::addLibraryPath(QStringLiteral(ORVALA_PLUGIN_DIR));
    prepareScale();
}

// Nothing here is pointed at. Qt's own blank cursor would be looked for in every cursor theme.
void hidePointer()
{
    QPixmap nothing(1, 1);
    nothing.fill(Qt::transparent);
    QApplication::setOverrideCursor(QCursor(nothing));
}

void readScreenSize()
{
    const QSize size = QGuiApplication::primaryScreen()->size();
    SystemConfig::mScreen_Width = size.width();
    SystemConfig::mScreen_Height = size.height();
}

void setLocale()
{
    logLine("locale=", QLocale::system().name());
    QTextCodec::setCodecForLocale(QTextCodec::codecForName("UTF-8"));
    // Numbers in files and replies have a point, whatever the country.
    std::setlocale(LC_NUMERIC, "C");
}

void setFont()
{
    const QString path = QStringLiteral(ORVALA_FONT_FILE);
    QString family = QStringLiteral("TiresiasScreenfont");
    logLine("The QT default font is:", QFont().family());
    const int id = QFontDatabase::addApplicationFont(path);
    if (id < 0) {
        logLine("load font file failed", path);
    } else {
        logLine("load font file success", path);
        family = QFontDatabase::applicationFontFamilies(id).value(0, family);
    }
    QFont font;
    font.setFamily(family);
    logLine("The QT set font is:", family);
    QApplication::setFont(font);
}

void startIpcThread()
{
    IpcThread *thread = IpcThread::getInstance();
    if (!thread)
        return;
    thread->start();
    while (!thread->isReady()) {
        logLine("orvala main function,wait start...");
        ::usleep(READY_POLL_MICROSECONDS);
    }
    logLine("orvala main function,a exec.");
}

void endIpcThread()
{
    IpcThread *thread = IpcThread::getInstance();
    if (!thread)
        return;
    thread->stop(); // it has been told already, unless the event loop ended without the shell
    const bool ended = thread->wait();
    logLine("orvala main function,ipc thread return ", ended ? "true." : "false.");
    delete thread;
}

void sayGoodbye()
{
    _NETWORK_MSG_T message = {};
    message.type = netcommon::MSG_EXIT_REQUEST;
    Ipc *ipc = Ipc::getInstance();
    ipc->sendIpcMsg(message);
    logLine("orvala main function,delete orvalaipc.");
    delete ipc;
}

} // namespace

int main(int argc, char *argv[])
{
    prepareProcess();
    FontSetup fonts;
    MainApplication application(argc, argv);
    fonts.finish();
    hidePointer();
    applyScale();
    readScreenSize();
    initResources();
    MainWidget mainWidget;
    setLocale();
    setFont();
    startIpcThread();
    // A screen without a window manager leaves a full-screen window at its own size.
    mainWidget.setGeometry(QGuiApplication::primaryScreen()->geometry());
    mainWidget.showFullScreen();
    const int exitCode = QApplication::exec();
    startExitDeadline(exitCode);
    endIpcThread();
    sayGoodbye();
    return exitCode;
}
