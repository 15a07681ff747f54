#pragma once

#include "network/systemconfig.h"

#include <QDir>
#include <QFile>
#include <QSettings>
#include <QSqlDatabase>
#include <QSqlQuery>
#include <QTemporaryDir>
#include <QVariant>

// A folder with an account file that the configuration points at, for a test's lifetime.
class AccountFile
{
public:
    AccountFile() { use(mFolder.filePath("accounts.db")); }

    // Lets the configuration name another file.
    void use(const QString &path)
    {
        mPath = path;
        QSettings config(mFolder.filePath("config.ini"), QSettings::IniFormat);
        config.setValue("DBPath/DBPath", path);
        config.sync();
        SystemConfig::setConfigFile(config.fileName());
    }
    QString path() const { return mPath; }
    QString folder() const { return mFolder.path(); }
    bool exists() const { return QFile::exists(mPath); }
    QStringList files() const { return QDir(folder()).entryList({"accounts.db*"}, QDir::Files); }
    void write(const QString &suffix, const QByteArray &content) const
    {
        QFile file(mPath + suffix);
        if (file.open(QIODevice::WriteOnly))
            file.write(content);
    }

private:
    QTemporaryDir mFolder;
    QString mPath;
};

// Another program's connection to an SQLite file.
class OtherConnection
{
public:
    explicit OtherConnection(const QString &path)
    {
        QSqlDatabase database = QSqlDatabase::addDatabase("QSQLITE", "other");
        database.setDatabaseName(path);
        database.open();
    }
    ~OtherConnection()
    {
        QSqlDatabase::database("other", false).close();
        QSqlDatabase::removeDatabase("other");
    }
    OtherConnection(const OtherConnection &) = delete;
    OtherConnection &operator=(const OtherConnection &) = delete;

    // The first column of the rows; empty when the statement fails.
    QStringList rows(const QString &statement) const
    {
        QSqlQuery query(QSqlDatabase::database("other", false));
        QStringList values;
        query.exec(statement);
        while (query.next())
            values << query.value(0).toString();
        return values;
    }
};
