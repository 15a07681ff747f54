#pragma once

#include <QApplication>
#include <QPointer>
#include <QWidget>

class QKeyEvent;

// The application object. It sees every key press first: translates it by the key map, takes the
// remote's exit key out, and hands the rest to the status dialog while that one is shown.
class MainApplication : public QApplication
{
    Q_OBJECT

public:
    MainApplication(int &argc, char **argv);

    // While visible is true every key press goes to the dialog, whatever widget has the focus.
    static void setDialog(QWidget *dialog, bool visible);

    bool notify(QObject *receiver, QEvent *event) override;

private:
    bool deliver(QObject *receiver, QEvent *event);
    bool takeKeyPress(QKeyEvent *event);

    static QPointer<QWidget> mDialogObj;
    static bool mDialogVisible;

    // The event that is on its way: a key passes here for its window and again for the widget.
    const QEvent *mPassing = nullptr;
};
