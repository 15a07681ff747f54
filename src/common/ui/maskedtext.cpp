#include "common/ui/maskedtext.h"

#include <QTextBoundaryFinder>

#include <algorithm>

QString MaskedText::shown() const
{
    if (!mMasked)
        return mText;
    QString shown;
    for (int place = 0; place < mText.size(); place = next(place)) {
        if (isClear(place))
            shown += mText.midRef(place, next(place) - place);
        else
            shown += QLatin1Char('*');
    }
    return shown;
}

void MaskedText::setMasked(bool masked)
{
    mMasked = masked;
    hideLast();
}

void MaskedText::hideLast()
{
    mClearStart = mClearEnd = 0;
}

int MaskedText::replace(int start, int end, const QString &characters)
{
    start = qBound(0, start, mText.size());
    end = qBound(start, end, mText.size());
    mText.replace(start, end - start, characters);
    findCharacters();
    mClearEnd = start + characters.size();
    mClearStart = characters.isEmpty() ? mClearEnd : previous(mClearEnd);
    return mClearEnd;
}

void MaskedText::findCharacters()
{
    mStarts = {0};
    QTextBoundaryFinder finder(QTextBoundaryFinder::Grapheme, mText);
    while (finder.toNextBoundary() > 0)
        mStarts << finder.position();
}

int MaskedText::next(int place) const
{
    const auto start = std::upper_bound(mStarts.cbegin(), mStarts.cend(), place);
    return start == mStarts.cend() ? mStarts.last() : *start;
}

int MaskedText::previous(int place) const
{
    const auto start = std::lower_bound(mStarts.cbegin(), mStarts.cend(), place);
    return start == mStarts.cbegin() ? 0 : *(start - 1);
}

int MaskedText::placeInText(int placeShown) const
{
    if (!mMasked)
        return qBound(0, placeShown, mText.size());
    int place = 0;
    for (int shown = 0; place < mText.size() && shown < placeShown; place = next(place))
        shown += isClear(place) ? next(place) - place : 1;
    return place;
}

int MaskedText::placeShown(int placeInText) const
{
    if (!mMasked)
        return qBound(0, placeInText, mText.size());
    int shown = 0;
    for (int place = 0; place < qMin(placeInText, mText.size()); place = next(place))
        shown += isClear(place) ? next(place) - place : 1;
    return shown;
}
