#pragma once

#include "network/systemconfig.h"

#include <QFile>
#include <QTemporaryDir>

// A configuration file of the test's own, and a screen of 1280 x 720.
class TestConfig
{
public:
    explicit TestConfig(const QByteArray &lines = QByteArray())
    {
        SystemConfig::mScreen_Width = 1280;
        SystemConfig::mScreen_Height = 720;
        SystemConfig::setProxyFile(mFolder.filePath("no-proxy"));
        write(lines);
    }
    void write(const QByteArray &lines)
    {
        const QString path = mFolder.filePath(QString("config%1.ini").arg(++mCount));
        QFile file(path);
        if (!file.open(QIODevice::WriteOnly) || file.write(lines) != lines.size())
            qFatal("cannot write %s", qPrintable(path));
        file.close();
        SystemConfig::setConfigFile(path);
    }

private:
    QTemporaryDir mFolder;
    int mCount = 0;
};
