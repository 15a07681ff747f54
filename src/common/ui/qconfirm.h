#pragma once

#include "common/ui/popupoverlay.h"

class DialogPanel;

// One of the program's yes/no questions. Left and Right move between Yes and No, Select answers;
// other keys do nothing. Answering does not close it: that is up to whoever shows it.
class QConfirm : public PopupOverlay
{
    Q_OBJECT

public:
    enum Type {
        DeleteTag = 0, // the text is the tag, with the service's entities
        SignOut = 1,   // names the signed-in user; takes no text, like those below
        DeleteAccount = 2,
        UnknownUser = 3
    };

    explicit QConfirm(QWidget *parent = nullptr);

    // Asks the question of the type; of any other there is none, and every key is passed on. The
    // Return key does nothing, except that an overlay around this one gets it.
    void init(int type, QString text = QString());

signals:
    void clickConfirm();
    void clickCancel();

protected:
    void keyPressEvent(QKeyEvent *event) override;

private:
    void answer(int button);

    int mType = -1;
    DialogPanel *mPanel = nullptr;
};
