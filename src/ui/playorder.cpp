#include "ui/playorder.h"

#include <QRandomGenerator>

#include <algorithm>
#include <numeric>
#include <utility>

namespace playorder {

namespace {

// A source that gives the same number for ever must not hold the show up.
constexpr int kMostDraws = 64;

int otherThan(int neighbour, int end, const RandomSource &random)
{
    for (int draw = 0; draw < kMostDraws; ++draw) {
        const int index = static_cast<int>(random() % static_cast<quint32>(end));
        if (index != neighbour)
            return index;
    }
    return (neighbour + 1) % end;
}

void orderRandom(QVector<int> &array, int start, const RandomSource &random)
{
    for (int i = start; i < array.size(); ++i)
        array[i] = otherThan(i > 0 ? array.at(i - 1) : -1, array.size(), random);
}

void shuffle(QVector<int> &array, int start, const RandomSource &random)
{
    const int end = array.size();
    for (int i = start; i < end; ++i) {
        const int other = static_cast<int>(random() % static_cast<quint32>(end - i)) + i;
        std::swap(array[i], array[other]);
    }
}

} // namespace

RandomSource systemRandom()
{
    return [] { return QRandomGenerator::global()->generate(); };
}

void order(QVector<int> &array, int start, int mode, const RandomSource &random)
{
    if (mode == Random)
        orderRandom(array, start, random);
    else if (mode == Shuffle)
        shuffle(array, start, random);
    else
        std::iota(array.begin() + start, array.end(), start);
}

} // namespace playorder

PlayArray::PlayArray(playorder::RandomSource random)
    : mRandom(std::move(random))
{
}

int PlayArray::at(int position) const
{
    const int size = mRecords.size();
    return position < size ? mRecords.value(position, -1) : mNextRound.value(position - size, -1);
}

void PlayArray::clear()
{
    mRecords.clear();
    mNextRound.clear();
}

void PlayArray::extend(int recordCount, int mode)
{
    const int start = mRecords.size();
    if (recordCount <= start)
        return;
    mRecords.resize(recordCount);
    std::iota(mRecords.begin() + start, mRecords.end(), start);
    playorder::order(mRecords, start, mode, mRandom);
    drawNextRound(mode);
}

// From the normal order: an earlier random one may hold a record twice and lack another.
void PlayArray::reorder(int mode)
{
    std::iota(mRecords.begin(), mRecords.end(), 0);
    playorder::order(mRecords, 0, mode, mRandom);
    drawNextRound(mode);
}

void PlayArray::shrink(int recordCount, int mode)
{
    mRecords.resize(std::clamp(recordCount, 0, mRecords.size()));
    reorder(mode);
}

void PlayArray::startOver(int mode)
{
    mRecords.swap(mNextRound);
    drawNextRound(mode);
}

void PlayArray::drawNextRound(int mode)
{
    if (!mIsRound)
        return;
    mNextRound.resize(mRecords.size());
    for (int draw = 0; draw < playorder::kMostDraws; ++draw) {
        std::iota(mNextRound.begin(), mNextRound.end(), 0);
        playorder::order(mNextRound, 0, mode, mRandom);
        if (mNextRound.size() < 2 || mNextRound.first() != mRecords.last())
            return;
    }
}
