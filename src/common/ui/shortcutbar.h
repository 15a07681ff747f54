#pragma once

#include <QHash>
#include <QWidget>

class QHBoxLayout;

// The row of key hints at the bottom of a screen: each a rounded key cap and what the key does
// here. Entries are added once, in the order of their places from left to right, and shown or
// hidden as the screen's state changes.
class ShortcutBar : public QWidget
{
    Q_OBJECT

public:
    explicit ShortcutBar(QWidget *parent = nullptr);

    // Adds the hint for a key of the remote (a RemoteKey), shown at once. A key with a picture in
    // the resources has it for a cap, any other its name.
    void addEntry(int key, const QString &text);
    void setText(int key, const QString &text);
    void setShown(int key, bool shown);
    // Shows these entries and no other.
    void showOnly(const QList<int> &keys);

    bool isShown(int key) const;
    QString text(int key) const;

private:
    struct Entry
    {
        QWidget *widget;
        class QLabel *text;
    };

    QHBoxLayout *mRow;
    QHash<int, Entry> mEntries;
};
