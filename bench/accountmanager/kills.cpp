#include "accountmanager/killrounds.h"
#include "support/bench.h"

#include <QCoreApplication>

// kills [rounds]: kills a process during account writes, 10,000 times unless told otherwise.
int main(int argc, char **argv)
{
    QCoreApplication app(argc, argv);
    const int count = argc > 1 ? QByteArray(argv[1]).toInt() : 10000;
    KillRounds rounds;
    rounds.run(count);
    std::printf("%d kills, %d before the file was there, %d acknowledged writes: %d lost, "
                "%d files damaged\n",
                count, rounds.unborn, rounds.acknowledged, rounds.lost, rounds.damaged);
    return rounds.lost || rounds.damaged ? 1 : 0;
}
