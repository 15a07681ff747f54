#pragma once

#include <QByteArray>
#include <QJsonObject>
#include <QProcess>
#include <QString>
#include <QTemporaryDir>

#include <memory>

// A headless Chromium, driven through its debugging pipe. Every page is opened by a visitor of its
// own, without cookies of the one before. Its commands block.
class Chromium
{
public:
    Chromium();
    ~Chromium();

    static bool isInstalled();

    void start();
    // Opens the page in a new tab; returns when it has been loaded.
    void open(const QString &url);
    // Runs the script in the page.
    void run(const QString &script);
    // Runs the script, which leaves the page; returns when the next one has been loaded.
    void leave(const QString &script);

private:
    class Process : public QProcess
    {
    public:
        int commands = -1; // the child's ends of the pipes
        int answers = -1;

    protected:
        void setupChildProcess() override;
    };

    QJsonObject send(const QString &method, const QJsonObject &parameters = {});
    void waitForLoad();
    QJsonObject next();

    QTemporaryDir mProfile;
    Process mProcess;
    int mCommands = -1;
    int mAnswers = -1;
    int mLast = 0; // number of the last command
    QByteArray mRead;
    QString mSession; // of the page
    bool mLoaded = false;
};
