#include "ui/playorder.h"

#include <QtTest>

#include <algorithm>
#include <numeric>

namespace {

// A small generator of the tests' own, so that a run can be repeated.
playorder::RandomSource seeded(quint32 seed)
{
    return [state = seed]() mutable {
        state ^= state << 13;
        state ^= state >> 17;
        state ^= state << 5;
        return state;
    };
}

QVector<int> records(const PlayArray &array)
{
    QVector<int> all;
    for (int i = 0; i < array.size(); ++i)
        all << array.at(i);
    return all;
}

bool repeatsNeighbour(const PlayArray &array)
{
    const QVector<int> all = records(array);
    return std::adjacent_find(all.begin(), all.end()) != all.end();
}

bool isPermutation(const QVector<int> &all)
{
    QVector<int> normal(all.size());
    std::iota(normal.begin(), normal.end(), 0);
    return std::is_permutation(all.begin(), all.end(), normal.begin());
}

} // namespace

class TestPlayOrder : public QObject
{
    Q_OBJECT

private slots:
    void randomNeverRepeatsItsNeighbour()
    {
        for (int count : {1, 2, 3, 50}) {
            PlayArray array(seeded(17 + count));
            array.extend(count, playorder::Normal);
            for (int round = 0; round < 200; ++round) {
                array.reorder(playorder::Random);
                QCOMPARE(array.size(), count);
                QVERIFY(!repeatsNeighbour(array));
                for (int record : records(array))
                    QVERIFY(record >= 0 && record < count);
            }
            array.reorder(playorder::Shuffle); // holds every one again
            QVERIFY(isPermutation(records(array)));
        }
    }

    // Each of the 24 orders of four photos: 1000 times expected, the deviation's squares below the
    // bound that chance exceeds once in a thousand runs (23 degrees of freedom).
    void shuffleIsFair()
    {
        QMap<QVector<int>, int> seen;
        PlayArray array(seeded(4711));
        array.extend(4, playorder::Normal);
        for (int i = 0; i < 24000; ++i) {
            array.reorder(playorder::Shuffle);
            ++seen[records(array)];
        }
        QCOMPARE(seen.size(), 24);
        double squares = 0;
        for (int times : qAsConst(seen))
            squares += (times - 1000.0) * (times - 1000.0) / 1000.0;
        QVERIFY2(squares < 49.73, qPrintable(QString::number(squares)));
    }

    void appendedPagesKeepTheRules()
    {
        PlayArray shuffled(seeded(5));
        shuffled.extend(8, playorder::Shuffle);
        const QVector<int> first = records(shuffled);
        shuffled.extend(24, playorder::Shuffle);
        QCOMPARE(records(shuffled).mid(0, 8), first);
        QVERIFY(isPermutation(records(shuffled)));

        for (quint32 seed = 1; seed < 200; ++seed) {
            PlayArray random(seeded(seed));
            random.extend(1, playorder::Random);
            random.extend(3, playorder::Random);
            random.extend(8, playorder::Random);
            QVERIFY(!repeatsNeighbour(random));
        }
        PlayArray stuck([] { return 4u; });
        stuck.extend(5, playorder::Random);
        QVERIFY(!repeatsNeighbour(stuck));
    }

    void roundsDoNotMeetInTheSamePhoto();
};

void TestPlayOrder::roundsDoNotMeetInTheSamePhoto()
{
    for (int mode : {playorder::Random, playorder::Shuffle}) {
        PlayArray array(seeded(8));
        array.setRound(true);
        array.extend(3, mode);
        for (int round = 0; round < 300; ++round) {
            const QVector<int> next{array.at(3), array.at(4), array.at(5)};
            QVERIFY(next.first() != array.at(2));
            array.startOver(mode);
            QCOMPARE(records(array), next);
        }
    }
}

QTEST_APPLESS_MAIN(TestPlayOrder)
#include "tst_playorder.moc"
