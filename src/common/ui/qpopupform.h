#pragma once

#include "common/ui/popupoverlay.h"

#include <QPointer>

#include <cstdint>

class QKeyBoardInput;
class QPopUpList;

// The frame in which the screens pop up their lists, text inputs and questions: one signal for each
// thing that a user can want, whatever the form hosts. Answering does not close it: that is up to
// whoever shows it.
class QPopUpForm : public PopupOverlay
{
    Q_OBJECT

public:
    enum Kind {
        POPUP_FORM_TAG_LIST = 0, // lists: made by the screen that shows them
        POPUP_FORM_COMMENT_LIST = 1,
        POPUP_FORM_COMMENT_INPUT = 2, // inputs: a comment may have more than one line
        POPUP_FORM_TAG_INPUT = 3,
        POPUP_FORM_SEARCH_INPUT = 4,
        POPUP_FORM_TEXT_INPUT = 5,
        POPUP_FORM_CONFIRM = 6, // a question of QConfirm
    };

    explicit QPopUpForm(QWidget *parent = nullptr);

    // Builds an input, with the text to start with, or a question of that QConfirm::Type about the
    // text. Any other kind builds nothing and says so in the log.
    void initForm(int kind, const QString &text = QString(), int confirmType = 0);
    // Hosts a list, which becomes a child. Any other kind builds nothing and deletes the list.
    void initForm(int kind, QPopUpList *list);

    // Password mode of an input; nothing for other kinds.
    void setInputMode(bool isPassword);

signals:
    void returnPopUpForm(); // the user wants back
    void switchProgile(int32_t index);
    void clickConfirm();
    void editFinished(QString text);
    void shareClicked(QString &text);
    void delTag(int index);

public slots:
    void handleInput(QString text);
    void handleReturn();
    void handleClickConfirm();
    void handleSwitchProfile(int32_t index);
    void handleShareComment(QString &text);
    void handleDelItem(int index);

protected:
    void keyPressEvent(QKeyEvent *event) override;
    bool eventFilter(QObject *watched, QEvent *event) override;
    QWidget *focusReceiver() override;

private:
    void initInput(int kind, const QString &text);
    void initConfirm(int type, const QString &text);
    void host(QWidget *form);
    void wrap(QWidget *form, int kind);

    QPointer<QWidget> mHosted;
    QPointer<QKeyBoardInput> mInput;
};
