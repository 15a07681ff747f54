#include "accountmanager/killrounds.h"

#include <QtTest>

class TestKill : public QObject
{
    Q_OBJECT

private slots:
    void killedWritersLoseNothing()
    {
        KillRounds rounds;
        rounds.run(200);
        QCOMPARE(rounds.damaged, 0);
        QCOMPARE(rounds.lost, 0);
        // Kills fell before the file was there and after it had been written to.
        QVERIFY2(rounds.unborn > 3, qPrintable(QString::number(rounds.unborn)));
        QVERIFY2(rounds.acknowledged > 500, qPrintable(QString::number(rounds.acknowledged)));
    }
};

QTEST_GUILESS_MAIN(TestKill)
#include "tst_kill.moc"
