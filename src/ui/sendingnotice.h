#pragma once

#include "common/ui/popupoverlay.h"

// Covers the screen while it waits for the service to take what the user wrote. No key passes;
// Return gives up waiting.
class SendingNotice : public PopupOverlay
{
    Q_OBJECT

public:
    explicit SendingNotice(QWidget *screen);

protected:
    void keyPressEvent(QKeyEvent *event) override;
};
