#pragma once

#include "common/ui/qpopuplist.h"

#include <QVector>

class QListWidget;

// The comments or the tags of a photo in a pop-up: up to one row that adds another, and a row for
// each. Up, Down and the page keys move the mark, Select runs the row: adds, or deletes what may be
// deleted. Return leaves.
class NoteList : public QPopUpList
{
    Q_OBJECT

public:
    struct Note
    {
        QString heading; // small, above the text; "" for none
        QString text;    // plain
        bool canDelete = false;
    };

    // Empty for a list that nothing can be added to.
    explicit NoteList(const QString &addText, QWidget *parent = nullptr);

    // Shows the notes, or in their place a message, with the mark as near as may be to where it
    // was.
    void showNotes(const QVector<Note> &notes);
    void showMessage(const QString &message);

    int count() const { return mNotes.size(); }
    QString message() const;
    int currentRow() const;

signals:
    void addWanted();

protected:
    void keyPressEvent(QKeyEvent *event) override;

private:
    void fill(const QString &message);
    void move(int rows);
    void select();

    QString mAddText;
    QVector<Note> mNotes;
    QListWidget *mRows;
};
