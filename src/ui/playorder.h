#pragma once

#include <QVector>

#include <functional>

// In which order a slide show goes through its photos: plain functions over a source of randomness,
// which tests can fix.
namespace playorder {

enum Mode : int { Normal = 0, Random = 1, Shuffle = 2 };

using RandomSource = std::function<quint32()>;

// The source that the program uses.
RandomSource systemRandom();

// Orders the positions [start, end) of the array:
//   Normal   position i holds i
//   Random   position i holds any index below the end, never the one at i - 1
//   Shuffle  what the positions hold, in an order of which every one is equally likely
void order(QVector<int> &array, int start, int mode, const RandomSource &random);

} // namespace playorder

// The play array: for each position of the show the index of a record.
class PlayArray
{
public:
    explicit PlayArray(playorder::RandomSource random = playorder::systemRandom());

    int size() const { return mRecords.size(); }
    int at(int position) const { return mRecords.value(position, -1); }
    void clear() { mRecords.clear(); }

    // Adds the records that have come since, in the mode's order among themselves.
    void extend(int recordCount, int mode);
    // Orders all of it anew.
    void reorder(int mode);
    // Drops the records from that count on, for the list has fewer, and orders the rest anew.
    void shrink(int recordCount, int mode);
    // Orders all of it for another round, which does not begin with the record shown last.
    void startOver(int mode, int lastRecord);

private:
    playorder::RandomSource mRandom;
    QVector<int> mRecords;
};
