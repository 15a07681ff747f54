#pragma once

#include "data/packageproperty.h"
#include "ui/titleicon.h"

#include <QList>
#include <QWidget>

class QHBoxLayout;

// The menu across the top of the home screen: logo, five entries and the user's name.
//
// Left and Right move the focus mark, Select makes an entry the selected one (the list that the
// home screen shows) and runs it: four ask for a list by pressEnter(), the fifth for signing out.
// When the bar gets the focus the mark starts on the selected entry.
class UpWidget : public QWidget
{
    Q_OBJECT

public:
    enum Entry { HomeEntry, MyPhotosEntry, FavoritesEntry, SearchEntry, SignOutEntry };

    explicit UpWidget(QWidget *parent = nullptr);

    // Shows the signed-in user's name on one line, cut when it is wider than a fifth of the usable
    // width.
    void setUserName(const QString &name);
    QString shownUserName() const;

    // Takes the focus and asks for the featured photos.
    void returnToHome();
    // Takes mark and selection back from the sign-out entry, to the one selected before it.
    void cancelSignOut();

    // Shows whether the bar has the focus, which it counts as having until it first loses it.
    void updateFocusMark();

    int focusIndex() const { return mFocus; } // of the entry with the mark

public slots:
    void handleHomeEnterEvent();
    void handleMyPhotoEnterEvent();
    void handleSearchEnterEvent();
    void handleFavoriteEnterEvent();
    void handleLogoutEnterEvent();

signals:
    void pressEnter(PackageProperty &aPackageProperty);
    void signOutRequested();
    void keyPassedOn(QKeyEvent *event); // keys that the home screen handles

protected:
    void keyPressEvent(QKeyEvent *event) override;
    void focusInEvent(QFocusEvent *event) override;
    void focusOutEvent(QFocusEvent *event) override;

private:
    void addEntry(QHBoxLayout *row, const QString &text, bool signOut, void (UpWidget::*slot)());
    QWidget *makeUserColumn();
    void ask(int type, const QString &userId);
    void select(QKeyEvent *event);
    void restyle();

    QList<TitleIcon *> mEntries;
    int mFocus = 0;
    int mPreviousFocus = 0;
    int mSelected = 0;
    int mPreviousSelected = 0;
    bool mHasFocus = true;
    QLabel *mUserName = nullptr;
};
