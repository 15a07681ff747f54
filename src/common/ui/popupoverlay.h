#pragma once

#include <QPointer>
#include <QWidget>

// A child that lies over the whole of its parent, dims it and shows one panel in its middle; give
// it a parent that fills the screen. While it is shown no key passes to what lies below. It takes
// the focus when it is shown and gives it back to where it was when it goes, or to its parent when
// that is not seen any longer; with the focus policy Qt::NoFocus it leaves the focus alone, for a
// dialog that is handed its keys.
//
// An overlay inside an overlay covers that one, neither dims it again nor takes the focus by
// itself. In a parent whose layout holds it, it keeps the place that the layout gives.
class PopupOverlay : public QWidget
{
    Q_OBJECT

public:
    explicit PopupOverlay(QWidget *parent = nullptr);
    ~PopupOverlay() override;

    // Whether the focus is in an overlay that is shown: a screen below leaves it there.
    static bool holdsFocus();

    // The panel, which becomes a child; one that is there already is deleted later.
    void setPanel(QWidget *panel);

    bool eventFilter(QObject *watched, QEvent *event) override;

protected:
    void showEvent(QShowEvent *event) override;
    void hideEvent(QHideEvent *event) override;
    void paintEvent(QPaintEvent *event) override;
    void keyPressEvent(QKeyEvent *event) override;
    bool focusNextPrevChild(bool next) override;

    // Who gets the focus when the overlay is shown; the overlay itself unless told otherwise.
    virtual QWidget *focusReceiver() { return this; }
    bool isNested() const; // inside another overlay

private:
    void cover();
    void takeFocus();
    void giveFocusBack();

    QPointer<QWidget> mPanel;
    QPointer<QWidget> mFocusBefore;
};

// Gives a widget on the dark panel of a pop-up its light text. Palettes are not inherited below a
// widget with a style sheet: each one that shows text needs its own.
void setPopupColours(QWidget *widget);
