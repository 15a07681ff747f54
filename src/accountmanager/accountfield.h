#pragma once

#include <QLineEdit>

// A field of the account form. Its style sheet tells the look; it paints itself, though, for a
// style sheet's border picture is blurred on a dense screen.
class AccountField : public QLineEdit
{
public:
    explicit AccountField(QWidget *parent = nullptr);

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    void paintText(QPainter &painter, const QRect &room) const;
};
