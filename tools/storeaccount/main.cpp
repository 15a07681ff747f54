#include "accountmanager/accountmanagerhelper.h"
#include "accountmanager/database.h"
#include "network/jsonparser.h"
#include "network/systemconfig.h"

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QFile>
#include <QFileInfo>
#include <QSettings>
#include <QTemporaryDir>

#include <cstdio>

namespace {

struct Account
{
    QString mail;
    QString pin;
    QString name;
    QString accessToken;
    QString refreshToken;
};

int fail(const char *reason)
{
    std::fprintf(stderr, "orvala-store-account: %s\n", reason);
    return 1;
}

// The log of the database classes shows PINs and tokens.
void dropLog(QtMsgType, const QMessageLogContext &, const QString &) {}

// The path of the file comes from the configuration, as in the program itself.
void useDatabase(const QString &path, const QString &folder)
{
    const QString file = folder + QStringLiteral("/config.ini");
    QSettings config(file, QSettings::IniFormat);
    config.setValue(QStringLiteral("DBPath/DBPath"), QFileInfo(path).absoluteFilePath());
    config.sync();
    SystemConfig::setConfigFile(file);
}

bool readTokens(Account *account)
{
    QFile input;
    if (!input.open(stdin, QIODevice::ReadOnly))
        return false;
    const JsonObject tokens = JsonParser::parse(input.readAll());
    account->accessToken = JsonParser::string(tokens, QStringLiteral("access_token"));
    account->refreshToken = JsonParser::string(tokens, QStringLiteral("refresh_token"));
    return !account->accessToken.isEmpty() && !account->refreshToken.isEmpty();
}

// An account that is there already keeps its PIN and name, and has to be named with that PIN.
bool store(const Account &account)
{
    const AccountManagerHelper::Session session;
    AccountManagerHelper::setRefreshToken(account.refreshToken);
    AccountManagerHelper::setUserName(account.name);
    const bool known = AccountManagerHelper::getAccounts(true).contains(account.mail);
    const bool stored =
        known ? AccountManagerHelper::updateToken(account.mail, account.accessToken)
              : AccountManagerHelper::addAccount(account.mail, account.pin, account.accessToken);
    return stored && AccountManagerHelper::login(account.mail, account.pin);
}

void addOptions(QCommandLineParser *parser)
{
    parser->setApplicationDescription(
        QStringLiteral("Stores one account in an account database and marks it as used last. The "
                       "tokens are read from standard input as {\"access_token\": ..., "
                       "\"refresh_token\": ...}."));
    parser->addHelpOption();
    const QStringList options = {QStringLiteral("database"), QStringLiteral("mail"),
                                 QStringLiteral("pin"), QStringLiteral("name")};
    for (const QString &option : options)
        parser->addOption({option, QStringLiteral("The account's %1.").arg(option), option});
}

} // namespace

int main(int argc, char **argv)
{
    QCoreApplication app(argc, argv);
    QCommandLineParser parser;
    addOptions(&parser);
    parser.process(app);
    Account account = {parser.value(QStringLiteral("mail")), parser.value(QStringLiteral("pin")),
                       parser.value(QStringLiteral("name")), QString(), QString()};
    const QString database = parser.value(QStringLiteral("database"));
    if (database.isEmpty() || account.mail.isEmpty() || account.pin.isEmpty())
        return fail("--database, --mail and --pin are needed");

    qInstallMessageHandler(dropLog);
    const QTemporaryDir folder;
    if (!folder.isValid())
        return fail("no temporary folder");
    useDatabase(database, folder.path());
    DataBase::setOpenFailureNotice([] { fail("the database cannot be opened"); });
    if (!readTokens(&account))
        return fail("no access_token and refresh_token on standard input");
    return store(account) ? 0 : fail("the account was not stored, or has another PIN");
}
