#include "ui/formscrollarea.h"

#include "base/log.h"
#include "common/ui/remotekeys.h"
#include "platform/devicestate.h"
#include "ui/formscrollwidget.h"
#include "ui/gridowner.h"

#include <QKeyEvent>
#include <QScrollBar>

using gridfocus::Move;

namespace {

const char *const kAreaStyle = "border-image:none;background-color:transparent;border:0px;";

const char *const kScrollBarStyle =
    "QScrollBar:vertical {margin: 0px 0px 0px 0px; background-color: transparent; border-style: "
    "none; border: 0px; width: 9px;}QScrollBar::handle:vertical {border-image: "
    "url(:/res/ScrollBar_Icon.png); border: 4px;}QScrollBar::add-page:vertical {border-image: "
    "url(:/res/scrollbar_background.png); border: 4px;}QScrollBar::sub-page:vertical "
    "{border-image: url(:/res/scrollbar_background.png); border: 4px;}"
    "QScrollBar::sub-line:vertical {subcontrol-origin: margin; border: 0px;}"
    "QScrollBar::add-line:vertical {subcontrol-origin: margin; border: 0px;}";

const char *keyName(int key)
{
    switch (key) {
    case DEVICE_LEFT_KEY:
        return "DEVICE_LEFT_KEY";
    case DEVICE_RIGHT_KEY:
        return "DEVICE_RIGHT_KEY";
    case DEVICE_UP_KEY:
        return "DEVICE_UP_KEY";
    case DEVICE_DOWN_KEY:
        return "DEVICE_DOWN_KEY";
    case DEVICE_PAGEUP_KEY:
        return "DEVICE_PAGEUP_KEY";
    case DEVICE_PAGEDOWN_KEY:
        return "DEVICE_PAGEDOWN_KEY";
    default:
        return "DEVICE_RED_KEY";
    }
}

// Keys that the grid takes from its cells; the rest reaches it, if at all, by propagation.
bool isGridKey(int key)
{
    switch (key) {
    case DEVICE_UP_KEY:
    case DEVICE_DOWN_KEY:
    case DEVICE_RIGHT_KEY:
    case DEVICE_LEFT_KEY:
    case DEVICE_PAGEUP_KEY:
    case DEVICE_PAGEDOWN_KEY:
    case DEVICE_SELECT_KEY:
    case DEVICE_RETURN_KEY:
        return true;
    default:
        return false;
    }
}

bool isOwnersKey(int key)
{
    return key == DEVICE_RETURN_KEY || key == DEVICE_PLAY_KEY || key == DEVICE_PLAYPAUSE_KEY;
}

void logCannotMove(int key)
{
    logLine(keyName(key), " set index wrong");
}

} // namespace

FormScrollArea::FormScrollArea(QWidget *parent)
    : QScrollArea(parent)
{
    setContentsMargins(0, 0, 0, 0);
    setWidgetResizable(true);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setVerticalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setStyleSheet(QString::fromLatin1(kAreaStyle));
    verticalScrollBar()->setStyleSheet(QString::fromLatin1(kScrollBarStyle));
}

void FormScrollArea::resizeEvent(QResizeEvent *event)
{
    centreRows();
    QScrollArea::resizeEvent(event);
}

void FormScrollArea::centreRows()
{
    const QFrame *first = content() ? content()->cell(0) : nullptr;
    const int columns = first ? content()->column() : 0;
    if (columns < 1)
        return;
    const int rows = (content()->count() + columns - 1) / columns;
    setViewportMargins(0, qMax(0, (height() - rows * first->minimumHeight()) / 2), 0, 0);
}

FormScrollWidget *FormScrollArea::content() const
{
    return qobject_cast<FormScrollWidget *>(widget());
}

GridOwner *FormScrollArea::owner() const
{
    QWidget *parent = parentWidget();
    return parent ? dynamic_cast<GridOwner *>(parent->parentWidget()) : nullptr;
}

void FormScrollArea::initFocus()
{
    if (!content())
        return;
    if (QFrame *cell = content()->cell(content()->getIndex()))
        cell->setFocus();
}

void FormScrollArea::updateFocus()
{
    if (!content() || content()->count() < 1)
        return;
    logLine("set foucs on the first photo in search page");
    focusCell(0);
}

void FormScrollArea::focusInEvent(QFocusEvent *event)
{
    QScrollArea::focusInEvent(event);
    const int index = content() ? content()->getIndex() : -1;
    if (index < 0) {
        logLine("<lwj> not set focus");
        return;
    }
    content()->cell(index)->setFocus();
}

bool FormScrollArea::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() == QEvent::KeyPress) {
        auto *press = static_cast<QKeyEvent *>(event);
        if (isGridKey(press->key())) {
            keyPressEvent(press);
            press->accept(); // consumed: an unaccepted key would travel on to the parents
            return true;
        }
    }
    return QScrollArea::eventFilter(watched, event);
}

void FormScrollArea::keyPressEvent(QKeyEvent *event)
{
    GridOwner *screen = owner();
    event->accept();
    if (!screen || !content() || isRefused(screen))
        return;
    if (isOwnersKey(event->key()))
        screen->handleGridKey(event);
    else
        handleKey(screen, event);
}

bool FormScrollArea::isRefused(const GridOwner *screen) const
{
    if (!NetworkCableStatus) {
        logLine("network has plug out.reject select key");
        return true;
    }
    if (screen->isLoading()) {
        logLine("it is downloading data now, so no key press events!");
        return true;
    }
    return false;
}

void FormScrollArea::handleKey(GridOwner *screen, QKeyEvent *event)
{
    gridfocus::Situation at;
    at.index = content()->getIndex();
    at.count = content()->count();
    at.columns = content()->column();
    if (at.count < 1) {
        logLine("FormScrollArea::keyPressEvent photo item list is empty!");
        return;
    }
    if (at.index == -1) {
        handleUnfocused(screen, event);
        return;
    }
    if (at.columns < 1 || at.columns > 4) {
        logLine("column wrong! column now is ", at.columns);
        return;
    }
    if (event->key() == DEVICE_RED_KEY) {
        handleRed(screen, event);
        return;
    }
    at.packageType = screen->packageType();
    at.startIndex = screen->startIndex();
    at.records = screen->recordCount();
    take(gridfocus::step(event->key(), at), screen, event);
}

void FormScrollArea::handleUnfocused(GridOwner *screen, QKeyEvent *event)
{
    const int key = event->key();
    if (key == DEVICE_LEFT_KEY || key == DEVICE_RIGHT_KEY || key == DEVICE_UP_KEY)
        screen->handleGridKey(event);
}

void FormScrollArea::handleRed(GridOwner *screen, QKeyEvent *event)
{
    if (screen->isMainMenuHidden())
        return;
    screen->handleGridKey(event);
    if (!focusCell(0))
        logCannotMove(DEVICE_RED_KEY);
}

void FormScrollArea::take(const gridfocus::Step &step, GridOwner *screen, QKeyEvent *event)
{
    const int key = event->key();
    switch (step.move) {
    case Move::Drop:
        event->ignore();
        break;
    case Move::ToOwner:
        screen->handleGridKey(event);
        break;
    case Move::Enter:
        emit enterPress(step.target, true);
        break;
    case Move::PreviousBlock:
    case Move::NextBlock:
        change(screen, key, step.move == Move::NextBlock);
        break;
    case Move::PageUp:
        if (screen->handlePageUp(-1))
            moveFocus(step, screen, key);
        break;
    case Move::PageDown:
        if (screen->handlePageDown(-1))
            moveFocus(step, screen, key);
        break;
    case Move::Focus:
        moveFocus(step, screen, key);
        break;
    }
}

void FormScrollArea::change(GridOwner *screen, int key, bool next)
{
    logLine("FormScrollArea::keyPressEvent() ", keyName(key),
            next ? ": get next page" : ": get previous page");
    screen->changeBlock(next);
}

void FormScrollArea::moveFocus(const gridfocus::Step &step, GridOwner *screen, int key)
{
    if (focusCell(step.target)) {
        scrollTo(step.target, step.move == Move::Focus ? key : 0);
        emit selectChanged(step.target);
    } else if (step.otherwise != Move::Drop) {
        change(screen, key, step.otherwise == Move::NextBlock);
    } else {
        logCannotMove(key);
    }
}

// Where another page than the grid is shown by now, which has the focus, only the index moves.
bool FormScrollArea::focusCell(int index)
{
    if (!content()->setIndex(index))
        return false;
    if (isVisible())
        content()->cell(index)->setFocus();
    return true;
}

void FormScrollArea::scrollTo(int index, int key)
{
    const int row = index / content()->column();
    gridfocus::Rows rows;
    rows.height = content()->cell(0)->height();
    rows.contentTop = content()->y();
    rows.viewport = viewport()->height();
    int position = -1;
    if (key == DEVICE_UP_KEY)
        position = gridfocus::scrollUp(row, rows);
    else if (key == DEVICE_DOWN_KEY)
        position = gridfocus::scrollDown(row, rows);
    else
        position = gridfocus::scrollInto(row, rows);
    if (position >= 0)
        verticalScrollBar()->setValue(position);
}
