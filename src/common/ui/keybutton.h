#pragma once

#include "common/ui/picturebutton.h"

// A key of the on-screen keyboard: its text may use the whole of it, where a button of a style
// sheet would cut it at the border, and shrinks until it fits.
class KeyButton : public PictureButton
{
    Q_OBJECT

public:
    explicit KeyButton(QWidget *parent = nullptr);

    void setLabel(const QString &label); // as it is to be read, ampersands included
    void setMarked(bool marked);         // whether the key has the focus

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    QFont fittingFont() const;
};
