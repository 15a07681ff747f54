#include <QDirIterator>
#include <QProcess>
#include <QRegularExpression>
#include <QSettings>
#include <QtTest>

// What docs/configuration.md says, held against what the programs read and what the shipped files
// set.
class TestConfiguration : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase()
    {
        const QStringList parts = text("docs/configuration.md").split("\n## The service");
        QCOMPARE(parts.size(), 2);
        const QRegularExpression row("^\\| `([^`]+)` \\|", QRegularExpression::MultilineOption);
        mBrowser = matches(row, parts.at(0));
        mService = matches(row, parts.at(1));
        QVERIFY(mBrowser.size() > 40);
    }

    // Every key of the browser's is written out in its sources, as "Group/Key".
    void browserReadsWhatIsDocumented()
    {
        QString all;
        QDirIterator files(source("src"), {"*.cpp", "*.h"}, QDir::Files,
                           QDirIterator::Subdirectories);
        while (files.hasNext())
            all += text(QDir(source(".")).relativeFilePath(files.next()));
        const QRegularExpression key("\"([A-Z][A-Za-z]+/[A-Za-z_]+)\"");
        QCOMPARE(matches(key, all), mBrowser);
    }

    void shippedFilesSetWhatIsDocumented()
    {
        for (const char *name : {"config/device.ini", "config/desktop.ini"}) {
            const QSettings settings(source(name), QSettings::IniFormat);
            QStringList keys = settings.allKeys().filter(QRegularExpression("^(?!Keys/)"));
            keys.sort();
            QCOMPARE(keys, mBrowser);
        }
    }

    void serviceTakesWhatIsDocumented()
    {
        QProcess service;
        service.start(ORVALA_SERVICE_PROGRAM, {"serve", "--help"});
        QVERIFY(service.waitForFinished());
        const QRegularExpression option("^ *(?:-\\w,)?--([a-z-]+)",
                                        QRegularExpression::MultilineOption);
        QStringList options = matches(option, service.readAllStandardOutput());
        options.removeOne("help");
        QCOMPARE(options, mService);
    }

    void serviceFileSetsDocumentedKeys()
    {
        const QRegularExpression setting("^#?([a-z-]+) = ", QRegularExpression::MultilineOption);
        const QStringList keys = matches(setting, text("service/packaging/orvala-service.conf"));
        QVERIFY(keys.contains("data"));
        for (const QString &key : keys)
            QVERIFY2(mService.contains(key), qPrintable(key));
    }

private:
    static QString source(const QString &name)
    {
        return QStringLiteral(ORVALA_SOURCE_DIR "/") + name;
    }

    static QString text(const QString &name)
    {
        QFile file(source(name));
        return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QString();
    }

    // What the parentheses took, sorted, each once.
    static QStringList matches(const QRegularExpression &pattern, const QString &text)
    {
        QStringList found;
        for (auto match = pattern.globalMatch(text); match.hasNext();)
            found += match.next().captured(1);
        found.removeDuplicates();
        found.sort();
        return found;
    }

    QStringList mBrowser, mService;
};

QTEST_GUILESS_MAIN(TestConfiguration)
#include "tst_configuration.moc"
