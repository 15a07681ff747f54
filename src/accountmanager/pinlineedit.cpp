#include "accountmanager/pinlineedit.h"

#include "base/log.h"
#include "common/ui/remotekeys.h"

#include <QKeyEvent>
#include <QRegularExpressionValidator>
#include <QTimer>

PinLineEdit::PinLineEdit(int mapKey, QWidget *parent)
    : AccountField(parent)
    , mMapKey(mapKey)
{
    setMaxLength(1);
    setAlignment(Qt::AlignCenter);
    setValidator(
        new QRegularExpressionValidator(QRegularExpression(QStringLiteral("[0-9*]?")), this));
}

void PinLineEdit::setDigit(QChar digit)
{
    delete mTimer;
    mDigit = digit;
    setText(digit);
    mTimer = new QTimer(this);
    mTimer->setSingleShot(true);
    connect(mTimer, &QTimer::timeout, this, &PinLineEdit::showAsterisk);
    mTimer->start(SHOWN_FOR);
}

void PinLineEdit::clearDigit()
{
    delete mTimer;
    mDigit.clear();
    clear();
}

void PinLineEdit::showAsterisk()
{
    logLine("PinLineEdit::showAsterisk,  mMapKey = ", mMapKey);
    if (mTimer)
        mTimer->deleteLater(); // it is the one that has fired
    mTimer.clear();
    if (text().isEmpty())
        return;
    setText(QStringLiteral("*"));
    emit editCompleted(mMapKey);
}

void PinLineEdit::keyPressEvent(QKeyEvent *event)
{
    const int key = event->key();
    if (key >= Qt::Key_0 && key <= Qt::Key_9) {
        setDigit(QChar(key));
    } else if (key == DEVICE_SELECT_KEY) {
        emit returnPressed();
    } else if (key == DEVICE_CLEAR_KEY) {
        logLine("Clear is press!!");
        clearDigit();
    } else {
        AccountField::keyPressEvent(event);
    }
}
