#include "endtoend/television.h"

#include "accountmanager/accountitem.h"
#include "accountmanager/accountmanagerhelper.h"
#include "common/keyrobot.h"
#include "common/ui/keyboardlayout.h"
#include "common/ui/qpopupform.h"
#include "common/ui/qtoastwidget.h"
#include "data/packagemanager.h"
#include "data/photomanager.h"
#include "network/connection.h"
#include "network/jsonparser.h"
#include "network/systemconfig.h"
#include "platform/ipc.h"
#include "platform/ipcthread.h"
#include "ui/contentpages.h"
#include "ui/homewidget.h"
#include "ui/photoitem.h"
#include "ui/upwidget.h"

#include <QAbstractButton>
#include <QApplication>
#include <QKeyEvent>
#include <QLabel>
#include <QTest>
#include <QWebView>
#include <QWindow>

namespace {

constexpr int TOLERANCE = 12; // of a colour's part, after JPEG

bool isNear(const QColor &one, const QColor &other)
{
    return qAbs(one.red() - other.red()) <= TOLERANCE &&
           qAbs(one.green() - other.green()) <= TOLERANCE &&
           qAbs(one.blue() - other.blue()) <= TOLERANCE;
}

} // namespace

Television::Television()
    : mSettings(mFolder.filePath("config.ini"), QSettings::IniFormat)
    , mShell(mFolder.filePath("shell"))
{
    set("DBPath/DBPath", mFolder.filePath("accounts.db"));
    set("Max/CacheSize", 96);
    set("Network/PageSeconds", 20);
    mSettings.sync();
    SystemConfig::setConfigFile(mSettings.fileName());
    SystemConfig::setProxyFile(mFolder.filePath("proxy"));
    SystemConfig::mScreen_Width = 1280;
    SystemConfig::mScreen_Height = 720;
    netcommon::Ipc::setSocketPath(mFolder.filePath("shell").toStdString());
}

Television::~Television()
{
    mWindow.reset();
    PackageManager::clearAll();
    PhotoManager::clearAll();
    Connection::removeAllConnections();
    Connection::closeIdleSockets();
    AccountManagerHelper::logout();
    netcommon::IpcThread *thread = netcommon::IpcThread::getInstance();
    thread->stop();
    thread->wait();
    delete thread;
    delete netcommon::Ipc::getInstance();
}

void Television::useService(const QString &origin)
{
    set("Service/FeedBase", origin);
    set("Service/OAuthBase", origin + "/o/oauth2/");
    set("Service/SignInPage", origin + "/ServiceLogin");
}

bool Television::addAccount(const QString &mail, const QString &name, const QByteArray &tokens)
{
    const JsonObject answer = JsonParser::parse(tokens);
    const AccountManagerHelper::Session session;
    AccountManagerHelper::setRefreshToken(JsonParser::string(answer, "refresh_token"));
    AccountManagerHelper::setUserName(name);
    return AccountManagerHelper::addAccount(mail, "7305",
                                            JsonParser::string(answer, "access_token"));
}

bool Television::switchOn()
{
    mSettings.sync();
    SystemConfig::setConfigFile(mSettings.fileName());
    mWindow = std::make_unique<MainWidget>();
    netcommon::IpcThread::getInstance()->start();
    mWindow->setGeometry(0, 0, 1280, 720);
    mWindow->show();
    return mShell.accept() && QTest::qWaitForWindowActive(mWindow.get());
}

void Television::press(int key) const
{
    for (QEvent::Type type : {QEvent::KeyPress, QEvent::KeyRelease}) {
        QKeyEvent event(type, key, Qt::NoModifier);
        QCoreApplication::sendEvent(mWindow->windowHandle(), &event);
    }
}

void Television::press(const QList<int> &keys) const
{
    for (int key : keys)
        press(key);
}

bool Television::type(const QString &text) const
{
    press(DEVICE_SELECT_KEY);
    for (QPopUpForm *form : mWindow->findChildren<QPopUpForm *>()) {
        if (!form->isVisible())
            continue;
        KeyRobot robot(form);
        const bool typed = robot.type(text);
        robot.press(EnterKey);
        return typed;
    }
    return false;
}

bool Television::enter(int entry) const
{
    for (int row = 0; row < 3 && menuEntry() < 0; ++row)
        press(DEVICE_UP_KEY);
    const int way = entry - menuEntry();
    for (int i = 0; i < qAbs(way); ++i)
        press(way > 0 ? DEVICE_RIGHT_KEY : DEVICE_LEFT_KEY);
    if (menuEntry() != entry)
        return false;
    press(DEVICE_SELECT_KEY);
    return true;
}

QString Television::focus() const
{
    const QWidget *widget = QApplication::focusWidget();
    if (const auto *item = qobject_cast<const AccountItem *>(widget))
        return item->mail();
    if (const auto *cell = qobject_cast<const PhotoItem *>(widget))
        return cell->caption();
    if (const auto *button = qobject_cast<const QAbstractButton *>(widget))
        return button->text();
    return widget ? widget->metaObject()->className() : QString();
}

int Television::menuEntry() const
{
    const auto *menu = qobject_cast<const UpWidget *>(QApplication::focusWidget());
    return menu ? menu->focusIndex() : -1;
}

QStringList Television::accounts() const
{
    QStringList mails;
    for (const AccountItem *item : mWindow->findChildren<AccountItem *>())
        mails << item->mail();
    return mails;
}

QWebView *Television::page() const
{
    auto *view = mWindow->findChild<QWebView *>();
    return view && view->isVisible() ? view : nullptr;
}

HomeWidget *Television::home() const
{
    return mWindow->findChild<HomeWidget *>();
}

bool Television::isLoading() const
{
    return !home() || home()->isLoading();
}

QList<PhotoItem *> Television::cells() const
{
    QList<PhotoItem *> shown;
    for (PhotoItem *cell : mWindow->findChildren<PhotoItem *>()) {
        if (cell->isVisible())
            shown << cell;
    }
    return shown;
}

QStringList Television::captions() const
{
    QStringList texts;
    for (const PhotoItem *cell : cells())
        texts << cell->caption();
    return texts;
}

bool Television::showsColours(const QHash<QString, QColor> &expected) const
{
    for (const PhotoItem *cell : cells()) {
        const QImage picture = cell->picture().toImage();
        if (picture.isNull() ||
            !isNear(picture.pixelColor(picture.rect().center()), expected.value(cell->caption())))
            return false;
    }
    return !cells().isEmpty();
}

QString Television::position() const
{
    if (isLoading())
        return QString();
    const HomeState &state = home()->state();
    return QStringLiteral("%1/%2").arg(state.mPhotoIndexInTotal).arg(state.mPhotoDataCount);
}

QString Television::failure() const
{
    const auto *page = shown<FailurePage>();
    return page ? page->reason() : QString();
}

QString Television::toast() const
{
    const auto *toast = shown<QToastWidget>();
    return toast ? toast->text().simplified() : QString();
}

QString Television::label(const QString &name) const
{
    const auto *found = mWindow->findChild<QLabel *>(name);
    return found && found->isVisible() ? found->text() : QString();
}
