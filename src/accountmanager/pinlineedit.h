#pragma once

#include "accountmanager/accountfield.h"

#include <QPointer>

class QTimer;

// A box for one digit of a PIN. The digit shows for a moment, then turns into "*", and the focus
// may move on. Select emits returnPressed(), Clear empties the box.
class PinLineEdit : public AccountField
{
    Q_OBJECT

public:
    static constexpr int SHOWN_FOR = 600; // milliseconds

    // mapKey: the position in the form, which editCompleted() tells.
    explicit PinLineEdit(int mapKey, QWidget *parent = nullptr);

    // The digit typed last; empty while the box is.
    QString digit() const { return text().isEmpty() ? QString() : mDigit; }
    void setDigit(QChar digit);
    void clearDigit();

signals:
    void editCompleted(int mapKey);

public slots:
    void showAsterisk();

protected:
    void keyPressEvent(QKeyEvent *event) override;

private:
    int mMapKey;
    QString mDigit;
    QPointer<QTimer> mTimer; // while the digit is shown
};
