#pragma once

#include <QPoint>
#include <QRectF>
#include <QSize>
#include <QtAlgorithms>

// The arithmetic of what moves in the slide show: plain functions. Sizes are device pixels.
namespace slidemotion {

// A photo of that size in the middle of the screen.
QRect centred(const QSize &photo, const QSize &screen);

// Where a photo that fits the screen is painted at the moment 0 to 1 of its turn: it grows by up to
// that many percent and moves towards a corner, which the number of the turn chooses, but never
// uncovers what it covers at rest.
QRectF moved(const QSize &photo, const QSize &screen, qreal moment, int percent, int turn);

// How far texts that stand still otherwise are moved in a turn, along a small circle: within the
// radius, and never the same twice in a row.
QPoint drift(int turn, int radius);

} // namespace slidemotion

// Tells when the machine cannot keep up: told of each frame whether it came too late.
class SlidePace
{
public:
    // True when most of the last frames came too late.
    bool isTooSlow(bool isLateFrame)
    {
        mLate = static_cast<quint16>((mLate << 1) | (isLateFrame ? 1 : 0));
        mFrames = qMin(mFrames + 1, kWindow);
        return mFrames == kWindow && qPopulationCount(mLate) > kWindow / 2;
    }
    void restart() { mLate = 0, mFrames = 0; }

private:
    static constexpr uint kWindow = 16;
    quint16 mLate = 0; // a bit for each of the last frames
    uint mFrames = 0;
};
