#pragma once

#include "app/mainwidget.h"
#include "platform/fakeshell.h"

#include <QSettings>
#include <QStringList>
#include <QTemporaryDir>

#include <memory>

class HomeWidget;
class PhotoItem;
class QWebView;

// The television: the program's own main window on a screen of 1280 x 720, its settings and account
// file, the remote, and what somebody in front of it sees.
class Television
{
public:
    Television();
    ~Television();

    void set(const QString &key, const QVariant &value) { mSettings.setValue(key, value); }
    void useService(const QString &origin);
    // Stores an account with the tokens that the service has given out.
    bool addAccount(const QString &mail, const QString &name, const QByteArray &tokens);
    bool switchOn();
    void press(int key) const;
    void press(const QList<int> &keys) const;
    // Opens the on-screen keyboard at what has the focus, writes with it and puts it away; false
    // when no keyboard comes, or it has not all of the characters.
    bool type(const QString &text) const;
    // Goes to that entry of the home screen's menu and presses it; false when it cannot be reached.
    bool enter(int entry) const;

    // What has the focus: an account's address, the caption of a cell or of a button, or the class
    // of the widget.
    QString focus() const;
    int menuEntry() const;        // that has the focus; -1 when the menu has not
    QStringList accounts() const; // addresses, from above
    QWebView *page() const;       // the service's own page, when it is shown; else null
    MainWidget *window() const { return mWindow.get(); }
    HomeWidget *home() const; // null before the sign-in
    bool isLoading() const;
    QStringList captions() const; // of the cells on the screen
    // Every cell on the screen shows a picture whose middle has about the colour that the table has
    // for its caption.
    bool showsColours(const QHash<QString, QColor> &expected) const;
    QString position() const; // in the list, as "3/23"
    // The reason on the page for what did not load; empty when it is not shown.
    QString failure() const;
    // The one of that class that is on the screen; null without.
    template <typename Type>
    Type *shown() const
    {
        for (Type *widget : mWindow->findChildren<Type *>()) {
            if (widget->isVisible())
                return widget;
        }
        return nullptr;
    }
    QString toast() const; // on one line; empty when none is shown
    // The text of a label of that name that is shown.
    QString label(const QString &name) const;

    FakeShell &shell() { return mShell; }

private:
    QList<PhotoItem *> cells() const;

    QTemporaryDir mFolder;
    QSettings mSettings;
    FakeShell mShell;
    std::unique_ptr<MainWidget> mWindow;
};
