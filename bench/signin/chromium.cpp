#include "signin/chromium.h"

#include <QJsonDocument>
#include <QStandardPaths>

#include <fcntl.h>
#include <sys/prctl.h>
#include <unistd.h>

#include <csignal>

namespace {

// Where the browser expects its debugging pipes.
constexpr int COMMANDS = 3;
constexpr int ANSWERS = 4;

QString program()
{
    return QStandardPaths::findExecutable("chromium");
}

void makePipe(int (&ends)[2])
{
    if (::pipe2(ends, O_CLOEXEC) != 0)
        qFatal("no pipe");
}

} // namespace

void Chromium::Process::setupChildProcess()
{
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
    // First out of the way: either may have the other's number.
    const int from = ::fcntl(commands, F_DUPFD, 10), to = ::fcntl(answers, F_DUPFD, 10);
    ::dup2(from, COMMANDS);
    ::dup2(to, ANSWERS);
}

Chromium::Chromium() = default;

Chromium::~Chromium()
{
    ::close(mCommands);
    ::close(mAnswers);
    mProcess.kill();
    mProcess.waitForFinished();
}

bool Chromium::isInstalled()
{
    return !program().isEmpty();
}

void Chromium::start()
{
    int commands[2], answers[2];
    makePipe(commands);
    makePipe(answers);
    mProcess.commands = commands[0];
    mProcess.answers = answers[1];
    mCommands = commands[1];
    mAnswers = answers[0];
    mProcess.setStandardErrorFile(QProcess::nullDevice());
    mProcess.start(program(),
                   {"--headless", "--no-sandbox", "--disable-gpu", "--disable-quic",
                    "--no-first-run", "--disable-background-networking",
                    "--disable-component-update", "--disable-sync", "--ignore-certificate-errors",
                    "--window-size=1280,720", "--user-data-dir=" + mProfile.path(),
                    "--remote-debugging-pipe", "about:blank"});
    mProcess.waitForStarted();
    ::close(commands[0]);
    ::close(answers[1]);
    send("Browser.getVersion");
}

QJsonObject Chromium::next()
{
    int end = 0;
    while ((end = mRead.indexOf('\0')) < 0) {
        char buffer[65536];
        const ssize_t size = ::read(mAnswers, buffer, sizeof buffer);
        if (size <= 0)
            qFatal("the browser has gone");
        mRead.append(buffer, int(size));
    }
    QJsonObject message = QJsonDocument::fromJson(mRead.left(end)).object();
    mRead.remove(0, end + 1);
    mLoaded = mLoaded || message.value("method").toString() == "Page.loadEventFired";
    return message;
}

QJsonObject Chromium::send(const QString &method, const QJsonObject &parameters)
{
    QJsonObject command{{"id", ++mLast}, {"method", method}, {"params", parameters}};
    if (!mSession.isEmpty())
        command["sessionId"] = mSession;
    QByteArray text = QJsonDocument(command).toJson(QJsonDocument::Compact);
    text.append('\0');
    if (::write(mCommands, text.constData(), size_t(text.size())) != text.size())
        qFatal("the browser takes no command");
    for (;;) {
        const QJsonObject message = next();
        if (message["id"].toInt() == mLast)
            return message["result"].toObject();
    }
}

void Chromium::open(const QString &url)
{
    mSession.clear();
    const QJsonObject visitor = send("Target.createBrowserContext");
    const QJsonObject tab =
        send("Target.createTarget",
             {{"url", "about:blank"}, {"browserContextId", visitor["browserContextId"]}});
    mSession = send("Target.attachToTarget", {{"targetId", tab["targetId"]}, {"flatten", true}})
                   .value("sessionId")
                   .toString();
    send("Page.enable");
    mLoaded = false;
    send("Page.navigate", {{"url", url}});
    waitForLoad();
}

void Chromium::run(const QString &script)
{
    send("Runtime.evaluate", {{"expression", script}});
}

void Chromium::leave(const QString &script)
{
    mLoaded = false;
    run(script);
    waitForLoad();
}

void Chromium::waitForLoad()
{
    while (!mLoaded)
        next();
}
