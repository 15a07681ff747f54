#pragma once

#include "common/ui/selfpainted.h"

#include <QLabel>

// One entry of the top menu. Which of its looks it has is decided by the bar.
class TitleIcon : public SelfPainted<QLabel>
{
    Q_OBJECT

public:
    enum class Look { Normal, Focused, Selected, FocusedSelected };

    TitleIcon(const QString &text, bool signOut, QWidget *parent = nullptr);

    bool isSignOut;

    void setLook(Look look);
    // The style sheet of a look, for a title or the sign-out entry.
    static QString style(Look look, bool signOut);

    // Select emits pressEnter(); every other key is ignored. The bar hands its keys on.
    void keyPressEvent(QKeyEvent *event) override;

signals:
    void pressEnter();

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    void paintGround(QPainter &painter) const;
    QColor textColour() const;

    Look mLook = Look::Normal;
};
