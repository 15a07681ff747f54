#include "ui/photopopups.h"

#include "common/ui/qtoastwidget.h"
#include "ui/noteinput.h"
#include "ui/notelists.h"
#include "ui/picturedetailwidget.h"

PhotoPopups::PhotoPopups(PictureDetailWidget *detail, QWidget *screen)
    : QObject(screen)
    , mDetail(detail)
    , mToast(new QToastWidget(screen))
    , mInput(new NoteInput(screen, mToast))
    , mLists(new NoteLists(screen, mToast))
{
    connect(detail, &PictureDetailWidget::addCommentSignal, this,
            &PhotoPopups::showInputCommentDialog);
    connect(detail, &PictureDetailWidget::addTagSignal, this, &PhotoPopups::showInputTagDialog);
    connect(detail, &PictureDetailWidget::showTagSignal, this, &PhotoPopups::showTagList);
    connect(detail, &PictureDetailWidget::showMoreCommentSignal, this,
            &PhotoPopups::showMoreComment);
    connect(mLists, &NoteLists::addCommentWanted, this, &PhotoPopups::showInputCommentDialog);
    connect(mLists, &NoteLists::addTagWanted, this, &PhotoPopups::showInputTagDialog);
    connect(detail, &PictureDetailWidget::notesArrived, mLists, &NoteLists::take);
    connect(mInput, &NoteInput::posted, this, &PhotoPopups::refresh);
    connect(mLists, &NoteLists::changed, this, &PhotoPopups::refresh);
}

void PhotoPopups::showInputCommentDialog()
{
    mInput->showInputCommentDialog(mDetail->photo().request(PHOTO_COMMENTS_LIST));
}

void PhotoPopups::showInputTagDialog()
{
    if (mDetail->isSelfPhoto())
        mInput->showInputTagDialog(mDetail->photo().request(PHOTO_TAGS_LIST));
}

void PhotoPopups::showTagList()
{
    mLists->showTagList(mDetail->photo().request(PHOTO_TAGS_LIST), mDetail->isSelfPhoto());
}

void PhotoPopups::showMoreComment()
{
    mLists->showMoreComment(mDetail->photo().request(PHOTO_COMMENTS_LIST), mDetail->isSelfPhoto());
}

// The photo screen first: the list then joins its request.
void PhotoPopups::refresh()
{
    mDetail->refreshNotes();
    mLists->refresh();
}
