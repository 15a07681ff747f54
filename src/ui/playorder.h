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

// The play array: for each position of the show the index of a record. If the show goes round, the
// order of the next round is drawn beforehand, so that its photos can be fetched before their time.
class PlayArray
{
public:
    explicit PlayArray(playorder::RandomSource random = playorder::systemRandom());

    void setRound(bool isRound) { mIsRound = isRound; }

    int size() const { return mRecords.size(); }
    // Positions from the size on are those of the next round; -1: no record.
    int at(int position) const;
    void clear();

    // Adds the records that have come since, in the mode's order among themselves.
    void extend(int recordCount, int mode);
    // Orders all of it anew.
    void reorder(int mode);
    // Drops the records from that count on, for the list has fewer, and orders the rest anew.
    void shrink(int recordCount, int mode);
    // The next round becomes this one; it does not begin with the record that ended the last.
    void startOver(int mode);

private:
    void drawNextRound(int mode);

    playorder::RandomSource mRandom;
    bool mIsRound = false;
    QVector<int> mRecords;
    QVector<int> mNextRound;
};
