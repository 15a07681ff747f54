#include "common/ui/qkeyboard.h"

#include "common/ui/keyboardpages.h"
#include "common/ui/keybutton.h"
#include "common/ui/remotekeys.h"
#include "network/systemconfig.h"

#include <QHBoxLayout>
#include <QKeyEvent>

namespace {

constexpr int kKeySpacing = 4;
constexpr int kDigitColumns = 3;

const char *const kPictures[] = {
    ":/res/virtual_keyboard_left_arrow.png", ":/res/virtual_keyboard_right_arrow.png",
    ":/res/virtual_keyboard_up_arrow.png",   ":/res/virtual_keyboard_down_arrow.png",
    ":/res/virtual_keyboard_blank.png",      ":/res/virtual_keyboard_enter.png",
};

// The sizes of the input form that the keyboard is a part of.
int formWidth()
{
    return SystemConfig::mScreen_Width * 5 / 6;
}

int formHeight()
{
    return SystemConfig::mScreen_Height * 5 / 7;
}

QSize fieldSize()
{
    return {formWidth() * 28 / 49, formHeight() * 3 / 5};
}

int rowHeight()
{
    return formHeight() * 3 / 40;
}

int narrowGap()
{
    return formWidth() * 28 / 1568;
}

int wideGap()
{
    return formWidth() * 28 / 784;
}

// The columns of digits, which line up from row to row.
int digitsWidth()
{
    const int keys = fieldSize().width() - narrowGap() - 10 * kKeySpacing;
    return keys / 12 * kDigitColumns + (kDigitColumns - 1) * kKeySpacing;
}

QHBoxLayout *makeGroup()
{
    auto *group = new QHBoxLayout;
    group->setContentsMargins(0, 0, 0, 0);
    group->setSpacing(kKeySpacing);
    return group;
}

} // namespace

QKeyBoard::QKeyBoard(QWidget *parent)
    : QFrame(parent)
    , mPages(new KeyboardPages(this))
{
    setFixedSize(fieldSize());
    auto *rows = new QVBoxLayout(this);
    rows->setContentsMargins(0, 0, 0, 0);
    rows->setSpacing(0);
    mPages->setFixedHeight(rowHeight());
    rows->addWidget(mPages);
    for (int row = 0; row < kKeyRows; ++row)
        addRow(rows, row);
    initInvariableStr();
    setPage(KeyboardPage::Small);
    mKeys.at(mFocusIndex)->setMarked(true);
}

void QKeyBoard::addRow(QBoxLayout *rows, int row)
{
    const int first = kFirstKeyOfRow[row];
    const int end = kFirstKeyOfRow[row + 1];
    const bool isBottom = row == kKeyRows - 1;
    const bool isShort = end - first == 11; // shifted, as the rows of a typewriter are
    QHBoxLayout *line = makeGroup();
    line->setSpacing(0);
    if (isShort)
        line->addSpacing(narrowGap());
    QHBoxLayout *left = makeGroup();
    line->addLayout(left);
    for (int i = first; i < (isBottom ? end : end - kDigitColumns); ++i)
        left->addWidget(makeKey(i), isBottom ? 2 : 1);
    if (!isBottom) {
        line->addSpacing(isShort ? wideGap() : narrowGap());
        auto *digits = new QWidget(this);
        digits->setFixedWidth(digitsWidth());
        digits->setLayout(makeGroup());
        for (int i = end - kDigitColumns; i < end; ++i)
            static_cast<QBoxLayout *>(digits->layout())->addWidget(makeKey(i), 1);
        line->addWidget(digits);
    }
    rows->addStretch();
    rows->addLayout(line);
}

KeyButton *QKeyBoard::makeKey(int index)
{
    auto *key = new KeyButton(this);
    key->setFixedHeight(rowHeight());
    connect(key, &QPushButton::clicked, this, [this, index] {
        setFocusIndex(index);
        press(index);
    });
    mKeys.append(key);
    return key;
}

void QKeyBoard::initInvariableStr()
{
    for (int i = 0; i < kKeyCount; ++i) {
        if (!isPageKey(i))
            mKeys.at(i)->setLabel(keyLabel(mPage, i));
    }
    for (int i = CursorLeftKey; i <= NewLineKey; ++i)
        mKeys.at(i)->setIcon(QIcon(QString::fromLatin1(kPictures[i - CursorLeftKey])));
}

void QKeyBoard::setPage(KeyboardPage page)
{
    mPage = page;
    for (int i = 0; i < kKeyCount; ++i) {
        if (isPageKey(i))
            mKeys.at(i)->setLabel(keyLabel(page, i));
    }
    mPages->setPage(page);
}

void QKeyBoard::setNewLineEnabled(bool enabled)
{
    mKeys.at(NewLineKey)->setEnabled(enabled);
}

void QKeyBoard::setFocusIndex(int index)
{
    if (index < 0 || index >= kKeyCount || index == mFocusIndex)
        return;
    mKeys.at(mFocusIndex)->setMarked(false);
    mFocusIndex = index;
    mKeys.at(mFocusIndex)->setMarked(true);
}

void QKeyBoard::updateFocusIndex(QKeyEvent *event)
{
    setFocusIndex(movedKeyFocus(mFocusIndex, event->key()));
}

void QKeyBoard::press(int index)
{
    if (index == LettersKey || index == SymbolsKey || index == AccentsKey) {
        setPage(pageAfterKey(mPage, index));
        return;
    }
    const QString text = keyText(mPage, index);
    if (!text.isEmpty())
        emit textTyped(text);
    else if (mKeys.at(index)->isEnabled())
        emit functionPressed(index);
}

bool QKeyBoard::handleKey(QKeyEvent *event)
{
    switch (event->key()) {
    case DEVICE_LEFT_KEY:
    case DEVICE_RIGHT_KEY:
    case DEVICE_UP_KEY:
    case DEVICE_DOWN_KEY:
        updateFocusIndex(event);
        return true;
    case DEVICE_SELECT_KEY:
        // A key held a little too long types one character, but goes on deleting and moving.
        if (!event->isAutoRepeat() || (mFocusIndex >= CursorLeftKey && mFocusIndex != EnterKey))
            press(mFocusIndex);
        return true;
    case DEVICE_PAGEUP_KEY:
        setPage(turnedPage(mPage, -1));
        return true;
    case DEVICE_PAGEDOWN_KEY:
        setPage(turnedPage(mPage, 1));
        return true;
    case DEVICE_RED_KEY:
        setPage(otherOfPair(mPage));
        return true;
    default:
        return false;
    }
}

void QKeyBoard::keyPressEvent(QKeyEvent *event)
{
    event->setAccepted(handleKey(event));
}
