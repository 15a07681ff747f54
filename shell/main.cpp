#include "console.h"
#include "messagetext.h"
#include "paths.h"
#include "shellserver.h"
#include "terminationsignals.h"

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>

#include <cerrno>
#include <cstdio>
#include <cstring>

namespace {

const char HELP[] = "exit: end the program\n"
                    "zone N: tell the program that local time is N hours ahead of UTC\n"
                    "help: show these lines\n"
                    "quit: end the shell, not the program";

struct Options
{
    QString socket;
    bool once;
};

Options readOptions()
{
    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral(
        "Stands in for the device's menu shell: prints what Orvala reports and reads commands from "
        "its standard input (help lists them)."));
    parser.addHelpOption();
    const QCommandLineOption socket(QStringLiteral("socket"), QStringLiteral("Listen at <path>."),
                                    QStringLiteral("path"), QStringLiteral(ORVALA_PLATFORM_SOCKET));
    const QCommandLineOption once(QStringLiteral("once"),
                                  QStringLiteral("End when the program has gone."));
    parser.addOptions({socket, once});
    parser.process(*QCoreApplication::instance());
    return {parser.value(socket), parser.isSet(once)};
}

void report(int programs)
{
    if (programs == 0)
        Console::print(QStringLiteral("no program is connected"));
}

void setZone(ShellServer *server, const QString &hours)
{
    bool isNumber = false;
    const int zone = hours.toInt(&isNumber);
    if (isNumber)
        report(server->sendTimeZone(zone));
    else
        Console::print(QStringLiteral("zone: a whole number of hours, as in \"zone -5\""));
}

void execute(ShellServer *server, const QString &line)
{
    const QString command = line.section(QLatin1Char(' '), 0, 0);
    if (command == QLatin1String("exit"))
        report(server->sendExit());
    else if (command == QLatin1String("zone"))
        setZone(server, line.section(QLatin1Char(' '), 1).trimmed());
    else if (command == QLatin1String("quit"))
        QCoreApplication::quit();
    else if (command == QLatin1String("help"))
        Console::print(QString::fromLatin1(HELP));
    else if (!command.isEmpty())
        Console::print(QStringLiteral("unknown command: %1 (try help)").arg(command));
}

void printEvents(const ShellServer &server, bool once)
{
    QObject::connect(&server, &ShellServer::connected, &server,
                     [] { Console::print(QStringLiteral("connected")); });
    QObject::connect(&server, &ShellServer::disconnected, &server,
                     [] { Console::print(QStringLiteral("disconnected")); });
    QObject::connect(&server, &ShellServer::received, &server,
                     [once](const _NETWORK_MSG_T &message) {
                         Console::print(messageText(message));
                         if (once && message.type == netcommon::MSG_EXIT_REQUEST)
                             QCoreApplication::quit();
                     });
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication application(argc, argv);
    const TerminationSignals signalWatch;
    const Options options = readOptions();
    QObject::connect(&signalWatch, &TerminationSignals::terminated, &application,
                     &QCoreApplication::quit);

    ShellServer server;
    printEvents(server, options.once);
    QDir().mkpath(QFileInfo(options.socket).path());
    if (!server.listen(options.socket)) {
        std::fprintf(stderr, "orvala-shell: cannot listen at %s: %s\n", qPrintable(options.socket),
                     std::strerror(errno));
        return 1;
    }
    const Console console;
    QObject::connect(&console, &Console::lineEntered, &server,
                     [&server](const QString &line) { execute(&server, line); });
    return QCoreApplication::exec();
}
