#pragma once

#include <QByteArray>
#include <QObject>
#include <QSocketNotifier>
#include <QString>

// Lines typed on the standard input, and lines printed on the standard output.
class Console : public QObject
{
    Q_OBJECT

public:
    explicit Console(QObject *parent = nullptr);

    static void print(const QString &line);

signals:
    void lineEntered(const QString &line);

private:
    void readInput();

    QSocketNotifier mNotifier;
    QByteArray mUnfinished;
};
