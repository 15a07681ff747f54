#pragma once

#include <QObject>

class NoteInput;
class NoteLists;
class PictureDetailWidget;
class QToastWidget;

// What pops up over the photo screen: the lists of its comments and tags, and the keyboard for a
// new one. Brings the photo screen's wishes to NoteLists and NoteInput, and their results back.
class PhotoPopups : public QObject
{
    Q_OBJECT

public:
    // The screen, which owns it, is what everything pops up over.
    PhotoPopups(PictureDetailWidget *detail, QWidget *screen);

public slots:
    void showInputCommentDialog();
    void showInputTagDialog();
    void showTagList();
    void showMoreComment();

private:
    void refresh();

    PictureDetailWidget *mDetail;
    QToastWidget *mToast;
    NoteInput *mInput;
    NoteLists *mLists;
};
