#pragma once

#include "accountmanager/accountfile.h"
#include "accountmanager/accounttables.h"
#include "accountmanager/database.h"

#include <QMap>

#include <csignal>
#include <random>
#include <sys/wait.h>
#include <unistd.h>

// Kills a process at random moments while it creates the account file and writes to it, and counts
// what is missing or broken afterwards.
class KillRounds
{
public:
    int acknowledged = 0; // writes that returned true before the kill
    int unborn = 0;       // rounds that ended without a file
    int lost = 0;         // acknowledged writes that are not in the file
    int damaged = 0;      // files that are not whole

    // Every third round starts without a file, and every other one of these is killed before it has
    // told of anything.
    void run(int rounds)
    {
        for (int round = 0; round < rounds; ++round) {
            if (round % 3 == 0)
                startAfresh();
            writeUntilKilled(round % 6 == 0 ? 0 : upTo(8) + 1);
            check();
        }
    }

private:
    void startAfresh()
    {
        mAcknowledged.clear();
        const QStringList left = mFile.files();
        for (const QString &name : left) {
            // What a killed creation left must not disturb the next one.
            if (!name.contains(".new"))
                QFile::remove(mFile.folder() + '/' + name);
        }
    }

    int upTo(int most) { return std::uniform_int_distribution<int>(0, most)(mRandom); }

    // The kill falls into the few milliseconds after so many acknowledgements.
    void writeUntilKilled(int acknowledgements)
    {
        int ends[2];
        if (::pipe(ends) != 0)
            qFatal("no pipe");
        const pid_t writer = ::fork();
        if (writer == 0) {
            ::close(ends[0]);
            writeForEver(ends[1]);
        }
        ::close(ends[1]);
        QByteArray told;
        while (told.count('\n') < acknowledgements && readSome(ends[0], &told))
            continue;
        ::usleep(upTo(acknowledgements == 0 ? 12000 : 2500));
        ::kill(writer, SIGKILL);
        ::waitpid(writer, nullptr, 0);
        while (readSome(ends[0], &told))
            continue;
        ::close(ends[0]);
        noteAcknowledgements(told);
    }

    static bool readSome(int pipe, QByteArray *told)
    {
        char buffer[4096];
        const ssize_t length = ::read(pipe, buffer, sizeof buffer);
        if (length > 0)
            told->append(buffer, int(length));
        return length > 0;
    }

    // Each account is inserted with the token "1" and then updated to the token "2".
    [[noreturn]] void writeForEver(int pipe) const
    {
        qInstallMessageHandler([](QtMsgType, const QMessageLogContext &, const QString &) {});
        const auto tell = [pipe](const QByteArray &line) {
            if (::write(pipe, line.constData(), line.size()) != line.size())
                ::_exit(1);
        };
        DataBase database;
        if (database.openDataBase())
            tell("open\n");
        for (int i = mAcknowledged.size();; ++i) {
            const QByteArray user = "user" + QByteArray::number(i);
            if (!database.insertAccount({user, "7305", "1", "r", "false", "n"}))
                ::_exit(1); // a broken file: the parent finds out
            tell(user + " 1\n");
            if (database.updateToken(user, "2", "r"))
                tell(user + " 2\n");
        }
    }

    void noteAcknowledgements(const QByteArray &told)
    {
        const QByteArrayList lines = told.split('\n');
        mOpened = lines.first() == "open";
        for (const QByteArray &line : lines) {
            const QByteArrayList words = line.split(' ');
            if (words.size() < 2)
                continue;
            ++acknowledged;
            mAcknowledged[words[0]] = words[1];
        }
    }

    void check()
    {
        if (!mFile.exists()) {
            ++unborn;
            lost += mOpened || !mAcknowledged.isEmpty();
            return;
        }
        const OtherConnection file(mFile.path());
        const int tables = file.rows("SELECT name FROM sqlite_master WHERE type='table'").size();
        const QStringList verdict = file.rows("PRAGMA integrity_check");
        damaged += verdict != QStringList("ok") || tables != int(accounttables::statements.size());
        compare(file.rows("SELECT usermail || ' ' || token FROM orvala1"));
    }

    // The write that the kill interrupted may be there or not.
    void compare(const QStringList &rows)
    {
        QMap<QString, QString> found;
        for (const QString &row : rows)
            found[row.section(' ', 0, 0)] = row.section(' ', 1);
        for (auto it = mAcknowledged.cbegin(); it != mAcknowledged.cend(); ++it)
            lost += found.value(it.key()) < it.value();
        mAcknowledged = found;
    }

    AccountFile mFile;
    std::mt19937 mRandom{20};
    QMap<QString, QString> mAcknowledged;
    bool mOpened = false;
};
