#pragma once

#include "data/packageproperty.h"
#include "network/errorcode.h"

#include <QObject>
#include <QPointer>

class QPopUpForm;
class QToastWidget;

// What the user writes about a photo: the keyboard for a comment or a tag, and its way to the
// service. What the service does not take stays in the keyboard's box, to be sent again.
class NoteInput : public QObject
{
    Q_OBJECT

public:
    // The screen is what the keyboard pops up over; the toast tells how it ended.
    NoteInput(QWidget *screen, QToastWidget *toast);

    // Opens the keyboard for the photo that the property names.
    void showInputCommentDialog(const PackageProperty &photo);
    void showInputTagDialog(const PackageProperty &photo);

public slots:
    void returnFromInputDialog();
    void returnFromInputDialogWithString(QString text);
    // Blocks until the service has answered.
    void postCommentOrTag(QString text);

signals:
    void posted(); // the service has taken it

private:
    void open(int kind, const PackageProperty &photo);
    ErrorCode send(QString text) const;

    QWidget *mScreen;
    QToastWidget *mToast;
    QPointer<QPopUpForm> mKeyboard;
    PackageProperty mPhoto;
    bool mIsTag = false;
};
