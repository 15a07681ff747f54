#include "common/ui/qkeyboardinput.h"

#include "base/i18n.h"
#include "common/ui/keymap.h"
#include "common/ui/qkeyboard.h"
#include "common/ui/remotekeys.h"
#include "common/ui/shortcutbar.h"
#include "common/ui/stretchedpicture.h"
#include "network/systemconfig.h"

#include <QClipboard>
#include <QGuiApplication>
#include <QInputMethodEvent>
#include <QKeyEvent>
#include <QPainter>
#include <QPlainTextEdit>
#include <QVBoxLayout>

namespace {

constexpr int kLongestText = 10000;
constexpr int kLastShownFor = 1000; // milliseconds
constexpr int kMargin = 28;
constexpr int kTextHeight = 26; // pixels of the font

bool isPrinting(const QString &text)
{
    return !text.isEmpty() && (text.at(0).isPrint() || text.at(0).isSurrogate());
}

// What a key types: a remote's digits come without a text.
QString typedText(const QKeyEvent &event)
{
    if (isPrinting(event.text()))
        return event.text();
    const bool isDigit = event.key() >= Qt::Key_0 && event.key() <= Qt::Key_9;
    return isDigit ? QString(QChar(event.key())) : QString();
}

} // namespace

QKeyBoardInput::QKeyBoardInput(QWidget *parent)
    : QWidget(parent)
    , mBox(new QPlainTextEdit(this))
    , mKeyBoard(new QKeyBoard(this))
{
    setFixedWidth(SystemConfig::mScreen_Width * 5 / 6);
    setFocusProxy(mBox);
    buildBox();
    build();
    setMultiLine(true);
    connect(mKeyBoard, &QKeyBoard::textTyped, this, &QKeyBoardInput::insert);
    connect(mKeyBoard, &QKeyBoard::functionPressed, this, &QKeyBoardInput::handleFunction);
}

void QKeyBoardInput::buildBox()
{
    mBox->setStyleSheet(
        QStringLiteral("QPlainTextEdit{border:0px;padding:10px 16px;background-color:transparent;"
                       "color:#f2f6f9;}"));
    QFont font = mBox->font();
    font.setPixelSize(kTextHeight);
    mBox->setFont(font);
    mBox->setCursorWidth(3);
    mBox->setUndoRedoEnabled(false);
    mBox->setWordWrapMode(QTextOption::WrapAtWordBoundaryOrAnywhere);
    mBox->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    mBox->setVerticalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    mBox->installEventFilter(this);
    KeyMap::setTakesText(mBox);
    connect(mBox->document(), &QTextDocument::contentsChange, this, &QKeyBoardInput::takeOver);
    connect(mBox, &QPlainTextEdit::textChanged, this, &QKeyBoardInput::handleTextChanged);
}

void QKeyBoardInput::build()
{
    auto *hints = new ShortcutBar(this);
    hints->addEntry(DEVICE_RED_KEY, I18n::shortCut(5));
    hints->addEntry(DEVICE_PAGEUP_KEY, I18n::shortCut(0));
    hints->addEntry(DEVICE_PAGEDOWN_KEY, I18n::shortCut(1));
    hints->addEntry(DEVICE_RETURN_KEY, I18n::shortCut(2));
    auto *rows = new QVBoxLayout(this);
    rows->setContentsMargins(kMargin, kMargin, kMargin, kMargin / 2);
    rows->setSpacing(kMargin * 2 / 3);
    rows->addWidget(mBox);
    rows->addWidget(mKeyBoard, 0, Qt::AlignHCenter);
    rows->addWidget(hints, 0, Qt::AlignHCenter);
}

// The box's own picture, behind it.
void QKeyBoardInput::paintEvent(QPaintEvent *)
{
    QPainter painter(this);
    painter.drawPixmap(mBox->pos(), stretchedPicture(QStringLiteral(":/res/InputBox_Focus.png"),
                                                     mBox->size(), kPictureBorder, this));
}

void QKeyBoardInput::setText(const QString &text)
{
    edit({0, mRealText.text().size()}, text);
    mRealText.hideLast();
    display(mCursor);
}

void QKeyBoardInput::setInputMode(bool isPassword)
{
    const int cursor = selection().end;
    mRealText.setMasked(isPassword);
    display(cursor);
}

void QKeyBoardInput::setMultiLine(bool multiLine)
{
    const int height = SystemConfig::mScreen_Height;
    setFixedHeight(multiLine ? height * 4 / 5 : height * 5 / 7);
    mMultiLine = multiLine;
    mKeyBoard->setNewLineEnabled(multiLine);
}

// Whatever else changes the box's text (pasting, dropping) changes the real text in the same place.
void QKeyBoardInput::takeOver(int place, int removed, int added)
{
    if (mIsDisplaying)
        return;
    // Counts may include the last paragraph's end, which is no character.
    const QString text = mBox->toPlainText().mid(place, added);
    if (text == mRealText.shown().mid(place, removed))
        return;
    edit({mRealText.placeInText(place), mRealText.placeInText(place + removed)}, text);
}

void QKeyBoardInput::handleTextChanged()
{
    if (!mIsDisplaying)
        display(mCursor);
}

bool QKeyBoardInput::eventFilter(QObject *watched, QEvent *event)
{
    if (watched != mBox)
        return QWidget::eventFilter(watched, event);
    if (event->type() == QEvent::KeyPress) {
        handleKey(static_cast<QKeyEvent *>(event));
        return true; // the box handles none by itself
    }
    if (event->type() == QEvent::InputMethod) {
        insert(static_cast<QInputMethodEvent *>(event)->commitString());
        return true;
    }
    return QWidget::eventFilter(watched, event);
}

void QKeyBoardInput::keyPressEvent(QKeyEvent *event)
{
    event->setAccepted(handleKey(event));
}

bool QKeyBoardInput::handleKey(QKeyEvent *event)
{
    event->accept();
    switch (event->key()) {
    case DEVICE_RETURN_KEY:
        emit returnClicked();
        return true;
    case DEVICE_CLEAR_KEY:
        erase(-1);
        return true;
    case DEVICE_PRE_KEY:
        moveCursor(-1);
        return true;
    case DEVICE_NEXT_KEY:
        moveCursor(1);
        return true;
    default:
        return mKeyBoard->handleKey(event) || handleTyping(event);
    }
}

bool QKeyBoardInput::handleTyping(QKeyEvent *event)
{
    if (event->key() == Qt::Key_Backspace || event->key() == Qt::Key_Delete) {
        erase(event->key() == Qt::Key_Delete ? 1 : -1);
        return true;
    }
    const bool isPaste = event->matches(QKeySequence::Paste);
    const QString text = isPaste ? QGuiApplication::clipboard()->text() : typedText(*event);
    if (text.isEmpty())
        return false;
    // Select ends what a real keyboard has typed, as its own Enter key is the remote's Select.
    mKeyBoard->setFocusIndex(EnterKey);
    insert(text);
    return true;
}

void QKeyBoardInput::handleFunction(int key)
{
    switch (key) {
    case CursorLeftKey:
    case CursorRightKey:
        moveCursor(key == CursorLeftKey ? -1 : 1);
        break;
    case CursorUpKey:
    case CursorDownKey:
        mBox->moveCursor(key == CursorUpKey ? QTextCursor::Up : QTextCursor::Down);
        break;
    case NewLineKey:
        insert(QStringLiteral("\n"));
        break;
    case DeleteKey:
        erase(-1);
        break;
    case EnterKey:
        emit inputFinished(mRealText.text());
        break;
    default:
        break;
    }
}

QKeyBoardInput::Range QKeyBoardInput::selection() const
{
    const QTextCursor cursor = mBox->textCursor();
    return {mRealText.placeInText(cursor.selectionStart()),
            mRealText.placeInText(cursor.selectionEnd())};
}

void QKeyBoardInput::insert(const QString &text)
{
    if (!text.isEmpty())
        replace(selection(), text);
}

void QKeyBoardInput::erase(int step)
{
    Range range = selection();
    if (range.start == range.end && step < 0)
        range.start = mRealText.previous(range.start);
    else if (range.start == range.end)
        range.end = mRealText.next(range.end);
    replace(range, QString());
}

void QKeyBoardInput::moveCursor(int step)
{
    const Range range = selection();
    display(step < 0 ? mRealText.previous(range.start) : mRealText.next(range.end));
}

void QKeyBoardInput::replace(Range range, const QString &text)
{
    edit(range, text);
    display(mCursor);
}

void QKeyBoardInput::edit(Range range, const QString &text)
{
    const int room = kLongestText - mRealText.text().size() + (range.end - range.start);
    mCursor = mRealText.replace(range.start, range.end, allowed(text, room));
    if (mRealText.isMasked())
        mHideTimer.start(kLastShownFor, this);
}

// Puts what is to be shown into the box, touching only what differs.
void QKeyBoardInput::display(int cursor)
{
    const QString before = mBox->toPlainText();
    const QString after = mRealText.shown();
    const int shorter = qMin(before.size(), after.size());
    int head = 0;
    while (head < shorter && before.at(head) == after.at(head))
        ++head;
    int tail = 0;
    while (tail < shorter - head &&
           before.at(before.size() - 1 - tail) == after.at(after.size() - 1 - tail))
        ++tail;
    mIsDisplaying = true;
    QTextCursor place(mBox->document());
    place.setPosition(head);
    place.setPosition(before.size() - tail, QTextCursor::KeepAnchor);
    place.insertText(after.mid(head, after.size() - tail - head));
    place.setPosition(mRealText.placeShown(cursor));
    mBox->setTextCursor(place);
    mIsDisplaying = false;
    mBox->ensureCursorVisible();
}

QString QKeyBoardInput::allowed(const QString &text, int room) const
{
    QString result;
    for (QChar character : text) {
        const bool isLineEnd =
            character == QLatin1Char('\n') || character == QChar::ParagraphSeparator;
        if (isLineEnd)
            result += mMultiLine ? QLatin1Char('\n') : QLatin1Char(' ');
        else if (character.category() != QChar::Other_Control)
            result += character;
    }
    if (result.size() > room)
        result.truncate(room > 0 && result.at(room - 1).isHighSurrogate() ? room - 1 : room);
    return result;
}

void QKeyBoardInput::timerEvent(QTimerEvent *event)
{
    if (event->timerId() != mHideTimer.timerId()) {
        QWidget::timerEvent(event);
        return;
    }
    mHideTimer.stop();
    const int cursor = selection().end;
    mRealText.hideLast();
    display(cursor);
}
