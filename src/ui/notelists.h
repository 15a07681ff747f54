#pragma once

#include "data/packageproperty.h"
#include "network/errorcode.h"
#include "ui/notelist.h"

#include <QObject>
#include <QPointer>
#include <QStringList>

class Package;
class PopupOverlay;
class QPopUpForm;
class QToastWidget;

// The lists of a photo's tags and comments in a pop-up, and deleting from them. One list at a time.
//
//   showTagList() -> from the cache, or take() -> fill
//   Select on a tag -> question -> updateTagList() -> changed() -> the list fetched anew
class NoteLists : public QObject
{
    Q_OBJECT

public:
    // The screen is what the lists pop up over; the toast tells how a deletion ended.
    NoteLists(QWidget *screen, QToastWidget *toast);

    // The property asks for the tags of a photo; the user's own can be changed.
    void showTagList(const PackageProperty &tags, bool isSelfPhoto);
    void showMoreComment(const PackageProperty &comments, bool isSelfPhoto);
    // Fetches the list that is shown anew.
    void refresh();
    // The photo screen asks for the same lists, and its call-back hears every answer.
    void take(const PackageProperty &property, ErrorCode code);

public slots:
    void returnFromTag();
    void returnFromComment();
    // Deletes the tag at that place of the list. Blocks until the service has answered.
    void updateTagList(int index);
    void deleteComment(int index);

signals:
    void addTagWanted();
    void addCommentWanted();
    void changed(); // on the service: what is cached of it is out of date

private:
    void open(const PackageProperty &property, bool isSelfPhoto, const QString &addText);
    void close();
    void request();
    void listArrived(ErrorCode code);
    QVector<NoteList::Note> tagsOf(const Package &package);
    QVector<NoteList::Note> commentsOf(const Package &package);
    void askToDelete(int index);
    void runDeletion(int index);
    void tellWhetherGone(ErrorCode code);
    bool isTagList() const { return mProperty.mType == PHOTO_TAGS_LIST; }

    QWidget *mScreen;
    QToastWidget *mToast;
    QPointer<QPopUpForm> mForm;
    QPointer<NoteList> mList;
    QPointer<PopupOverlay> mQuestion;
    PackageProperty mProperty;
    bool mIsSelfPhoto = false;
    QStringList mKeys;       // of the notes shown: tags as the service knows them, or comment ids
    QString mDeletedComment; // id of one that ought to be gone when the list has come
};
