#pragma once

#include "ui/homepages.h"
#include "ui/homestate.h"

#include <QPair>
#include <QWidget>

class InformationLine;
class ShortcutBar;

// The lower edge of the home screen: what is shown and where in it the focus is, and the hints of
// the keys that do something now.
class HomeBars : public QWidget
{
    Q_OBJECT

public:
    explicit HomeBars(QWidget *parent = nullptr);

    // Title of the list and the position in it, "" for none; both plain text.
    void setInformation(const QString &title, const QString &position);
    QString information() const; // the line as rich text

    // Keys, and what each does now.
    using Hints = QList<QPair<int, QString>>;
    void showHints(const Hints &hints);
    // The keys that lead somewhere on a page of the home screen.
    static Hints usefulKeys(const HomeState &state, HomePages::Page page, const Package *package);

private:
    InformationLine *mInformation;
    ShortcutBar *mShortcuts;
};
