#pragma once

#include <QString>
#include <QVector>

// A text and what is shown of it: itself, or, while it is masked, a "*" for each character but the
// one typed last. Characters are what a user takes for one (an emoji is one "*" and goes at one
// DEL), so that places in the text and in what is shown differ; both count UTF-16 units.
class MaskedText
{
public:
    const QString &text() const { return mText; }
    QString shown() const;

    bool isMasked() const { return mMasked; }
    void setMasked(bool masked);
    // Masks the last character too.
    void hideLast();

    // Puts the characters in place of those from start to end, places in the text. Returns the
    // place behind them.
    int replace(int start, int end, const QString &characters);

    // The places one character further on or back, at most to the ends.
    int next(int place) const;
    int previous(int place) const;

    // A place in the text for one in what is shown, and the other way round.
    int placeInText(int placeShown) const;
    int placeShown(int placeInText) const;

private:
    bool isClear(int place) const
    {
        return !mMasked || (place >= mClearStart && place < mClearEnd);
    }

    void findCharacters();

    QString mText;
    QVector<int> mStarts{0}; // of each character, and the text's end
    bool mMasked = false;
    int mClearStart = 0; // what is shown although the text is masked
    int mClearEnd = 0;
};
