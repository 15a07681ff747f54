#include "app/timerequest.h"
#include "platform/sntp.h"
#include "platform/systemclock.h"

#include <QNetworkProxy>
#include <QSignalSpy>
#include <QTest>
#include <QUdpSocket>
#include <QtEndian>

namespace {

QList<qint64> clockSettings;
int clockResult = 0;

int noteClock(const time_t *seconds)
{
    clockSettings.append(*seconds);
    return clockResult;
}

// A reply of the given size whose transmit time is so many seconds after 1900.
QByteArray reply(quint32 seconds, int size = 48)
{
    QByteArray datagram(size, '\xFF');
    qToBigEndian(seconds, datagram.data() + size - 8);
    return datagram;
}

} // namespace

class TestSntp : public QObject
{
    Q_OBJECT

private slots:
    void init()
    {
        setClockSetter(noteClock);
        clockSettings.clear();
        clockResult = 0;
        QVERIFY(mServer.bind(QHostAddress::LocalHost));
    }

    void cleanup()
    {
        mServer.close();
        setClockSetter(nullptr);
    }

    void buildsTheRequest()
    {
        const QDateTime local(QDate(2024, 2, 29), QTime(12, 30, 15), Qt::OffsetFromUTC, -5 * 3600);
        QByteArray expected = QByteArray::fromHex("1b0004fa000100000001").leftJustified(48, '\0');
        // 1709209815 is the same reading of the clock in UTC.
        expected.replace(40, 4, reply(1709209815u + 2208988800u).mid(40, 4));
        QCOMPARE(sntpRequest(local), expected);
    }

    void setsTheClock()
    {
        const QPair<QList<QByteArray>, qint64> rows[] = {
            {{reply(5)}, 5 - 2208988800LL},                              // before 1970
            {{reply(3913056000u, 8)}, 1704067200},                       // the shortest
            {{reply(3913056000u, 68)}, 1704067200},                      // with an authenticator
            {{reply(1), QByteArray(), reply(3913056001u)}, 1704067201}}; // the last one counts
        QNetworkProxy::setApplicationProxy({QNetworkProxy::HttpProxy, "127.0.0.1", 1});
        clockResult = -1;
        for (const auto &[replies, seconds] : rows) {
            clockSettings.clear();
            QCOMPARE(exchange(address(), replies).size(), 48);
            QCOMPARE(clockSettings, QList<qint64>({seconds}));
        }
        QNetworkProxy::setApplicationProxy(QNetworkProxy::NoProxy);
    }

    void toleratesOddServers()
    {
        for (const char *server : {"", "a b:::[", ":123"}) {
            TimeRequest request;
            QSignalSpy connectedSpy(&request, &TimeRequest::connected);
            request.start(QString::fromLatin1(server));
            request.sendRequest();
            request.readReply();
            QVERIFY(connectedSpy.isEmpty());
        }
        QCOMPARE(exchange(address(), {QByteArray(7, 'x')}).size(), 48);
        QVERIFY(clockSettings.isEmpty());
    }

private:
    QString address() const { return QStringLiteral("127.0.0.1:%1").arg(mServer.localPort()); }
    // Runs one exchange with the server and returns the request that it has seen.
    QByteArray exchange(const QString &server, const QList<QByteArray> &replies)
    {
        TimeRequest request;
        connect(&request, &TimeRequest::connected, &request, &TimeRequest::sendRequest);
        // Read at last, when all the replies are waiting.
        QSignalSpy answered(&request, &TimeRequest::readyRead);
        request.start(server);
        if (!QTest::qWaitFor([this] { return mServer.hasPendingDatagrams(); }))
            return QByteArray();
        QByteArray seen(200, '\0');
        QHostAddress client;
        quint16 port = 0;
        seen.truncate(int(mServer.readDatagram(seen.data(), seen.size(), &client, &port)));
        for (const QByteArray &datagram : replies)
            mServer.writeDatagram(datagram, client, port);
        if (!QTest::qWaitFor([&answered] { return !answered.isEmpty(); }))
            return QByteArray();
        request.readReply();
        return seen;
    }

    QUdpSocket mServer;
};

QTEST_GUILESS_MAIN(TestSntp)
#include "tst_sntp.moc"
