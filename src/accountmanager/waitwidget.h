#pragma once

#include <QWidget>

// Shown while a sign-in completes: "Login, please wait..." below a turning ring.
class WaitWidget : public QWidget
{
    Q_OBJECT

public:
    explicit WaitWidget(QWidget *parent = nullptr);

signals:
    // Return was pressed: the user does not want to wait any longer.
    void returnClicked();

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;
};
