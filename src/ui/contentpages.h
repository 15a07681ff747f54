#pragma once

#include "network/errorcode.h"

#include <QWidget>

class QLabel;
class QProgressIndicator;

// The pages that stand in the place of the grid.

// A page is on its way.
class LoadingPage : public QWidget
{
    Q_OBJECT

public:
    explicit LoadingPage(QWidget *parent = nullptr);

    void start();
    void stop();

private:
    QProgressIndicator *mIndicator;
};

// The list has no records.
class NoPhotoAvailableWidget : public QWidget
{
    Q_OBJECT

public:
    explicit NoPhotoAvailableWidget(QWidget *parent = nullptr);
};

// A page did not come: says why, and lets the user try again or go back. All other keys are left to
// the screen.
class FailurePage : public QWidget
{
    Q_OBJECT

public:
    explicit FailurePage(QWidget *parent = nullptr);

    void setReason(ErrorCode code);
    QString reason() const;

signals:
    void retryRequested();
    void leaveRequested();

protected:
    void keyPressEvent(QKeyEvent *event) override;

private:
    QLabel *mReason;
};
