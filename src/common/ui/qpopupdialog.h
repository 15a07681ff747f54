#pragma once

#include "common/ui/popupoverlay.h"

class DialogPanel;

// A titled message with one or two buttons, of which the first answers accepted() and the second
// rejected(). Right and Left move between the buttons, Select presses one, Return the last: the way
// out of every dialog. Answering does not close it: that is up to whoever shows it.
class QPopupDialog : public PopupOverlay
{
    Q_OBJECT

public:
    explicit QPopupDialog(QWidget *parent = nullptr);

    // Builds the dialog; with no button, or more than two, it builds nothing and says so in the
    // log.
    void initDialog(QString title, QString message, const QList<QString> &buttons);

signals:
    void accepted();
    void rejected();

protected:
    void keyPressEvent(QKeyEvent *event) override;

private:
    void press(int button);

    DialogPanel *mPanel = nullptr;
};
