#pragma once

#include "common/ui/popupoverlay.h"

// A message about a sign-in that failed, over the whole of its parent. Select or Return close it,
// which deletes it.
class ErrorDialog : public PopupOverlay
{
    Q_OBJECT

public:
    explicit ErrorDialog(QWidget *parent = nullptr);

    // Fills the dialog; without its button Return still closes it.
    void retranslateUi(const QString &title, const QString &errorText, bool hideCloseButton);

signals:
    void errorExitApp(); // it was closed

protected:
    void keyPressEvent(QKeyEvent *event) override;

private:
    void leave();
};
