#pragma once

#include <QPushButton>

// A button whose picture is stretched to the pixels of the screen. Its style sheet names the same
// picture and decides the text's colour and size, but Qt would stretch a border-image from the
// pixels of the layout, which blurs it on a dense screen.
class PictureButton : public QPushButton
{
    Q_OBJECT

public:
    explicit PictureButton(QWidget *parent = nullptr);
    explicit PictureButton(const QString &text, QWidget *parent = nullptr);

    // The pictures of a button that has the focus or the mark, and of every other.
    void setPictures(const QString &focused, const QString &normal);
    // A mark of focus, for a button that never takes the keyboard's focus itself.
    void setMarked(bool marked);

protected:
    void paintEvent(QPaintEvent *event) override;
    void paintPicture(QPainter &painter) const;

private:
    QString mFocused;
    QString mNormal;
    bool mMarked = false;
};
