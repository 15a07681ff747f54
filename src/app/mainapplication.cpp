#include "app/mainapplication.h"

#include "base/log.h"
#include "common/ui/keymap.h"
#include "common/ui/remotekeys.h"
#include "network/systemconfig.h"
#include "platform/ipc.h"

#include <QFont>
#include <QKeyEvent>
#include <QPalette>
#include <QScopedValueRollback>

QPointer<QWidget> MainApplication::mDialogObj;
bool MainApplication::mDialogVisible = false;

namespace {

QString hex(int key)
{
    return QString::number(key, 16);
}

} // namespace

MainApplication::MainApplication(int &argc, char **argv)
    : QApplication(argc, argv)
{
    setDialog(nullptr, false);
    QFont appFont = font();
    appFont.setPointSize(SystemConfig::appNormalFont());
    setFont(appFont);
    // A style sheet that leaves the ground of a field open takes it from here, whatever palette the
    // field has: pure white is too much for a dark room.
    QPalette colours = palette();
    colours.setColor(QPalette::Base, QColor(0xe6, 0xec, 0xf0));
    setPalette(colours);
    setApplicationVersion(SystemConfig::version());
}

void MainApplication::setDialog(QWidget *dialog, bool visible)
{
    mDialogVisible = visible;
    mDialogObj = visible ? dialog : nullptr;
}

bool MainApplication::notify(QObject *receiver, QEvent *event)
{
    if (!KeyMap::isFromPlatform(receiver, event) || KeyMap::instance().isEmpty())
        return deliver(receiver, event);
    QKeyEvent translated = KeyMap::instance().translated(*static_cast<QKeyEvent *>(event));
    const bool taken = deliver(receiver, &translated);
    event->setAccepted(translated.isAccepted());
    return taken;
}

// The value is false for whatever went to its receiver, also when that one took the event.
bool MainApplication::deliver(QObject *receiver, QEvent *event)
{
    if (event->type() != QEvent::KeyPress || event == mPassing) {
        QApplication::notify(receiver, event);
        return false;
    }
    const QScopedValueRollback<const QEvent *> passing(mPassing, event);
    if (takeKeyPress(static_cast<QKeyEvent *>(event)))
        return true;
    QApplication::notify(receiver, event);
    return false;
}

bool MainApplication::takeKeyPress(QKeyEvent *event)
{
    logLine("MainApplication: keyEvent->key()=", hex(event->key()));
    logLine("MainApplication: MEDIA_CENTER_KEY=", hex(MEDIA_CENTER_KEY));
    logLine("MainApplication: DEVICE_EXIT_KEY=", hex(DEVICE_EXIT_KEY));
    if (event->key() == DEVICE_EXIT_KEY) {
        logLine("[DEVICE_EXIT_KEY] exit");
        netcommon::Ipc::getInstance()->requestExit(false);
        return true;
    }
    if (!mDialogVisible || !mDialogObj)
        return false;
    QApplication::notify(mDialogObj, event);
    return true;
}
