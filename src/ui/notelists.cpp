#include "ui/notelists.h"

#include "accountmanager/accountmanagerhelper.h"
#include "base/i18n.h"
#include "common/ui/closelater.h"
#include "common/ui/qconfirm.h"
#include "common/ui/qpopupdialog.h"
#include "common/ui/qpopupform.h"
#include "common/ui/qtoastwidget.h"
#include "data/packagemanager.h"
#include "data/posthelper.h"
#include "ui/cachedlist.h"
#include "ui/detailphoto.h"
#include "ui/picturedetailwidget.h"
#include "ui/screentexts.h"
#include "ui/sendingnotice.h"

#include <QLocale>

#include <algorithm>

namespace {

bool isOwn(const Comment &comment, const PackageProperty &photo, bool isSelfPhoto)
{
    const QString user = AccountManagerHelper::getUserName();
    const bool hasName =
        !user.isEmpty() && (comment.userId() == user || comment.nickname() == user);
    return hasName || (isSelfPhoto && comment.userId() == photo.mUserId);
}

QString headingOf(const Comment &comment)
{
    const QString name = comment.nickname().isEmpty() ? comment.userId() : comment.nickname();
    const QString when =
        QLocale::c().toString(comment.createdTime(), QStringLiteral("d MMM yyyy, hh:mm"));
    const QString who = shownText(name).simplified();
    return when.isEmpty() ? who : who + QStringLiteral("   ") + when;
}

} // namespace

NoteLists::NoteLists(QWidget *screen, QToastWidget *toast)
    : QObject(screen)
    , mScreen(screen)
    , mToast(toast)
{
}

void NoteLists::showTagList(const PackageProperty &tags, bool isSelfPhoto)
{
    open(tags, isSelfPhoto, isSelfPhoto ? I18n::label(13) : QString());
}

void NoteLists::showMoreComment(const PackageProperty &comments, bool isSelfPhoto)
{
    open(comments, isSelfPhoto, I18n::label(6));
}

void NoteLists::open(const PackageProperty &property, bool isSelfPhoto, const QString &addText)
{
    if (mForm || property.mPhotoId.isEmpty())
        return;
    mProperty = property;
    mIsSelfPhoto = isSelfPhoto;
    mDeletedComment.clear();
    mForm = new QPopUpForm(mScreen);
    mList = new NoteList(addText, mForm);
    connect(mList, &NoteList::addWanted, this,
            isTagList() ? &NoteLists::addTagWanted : &NoteLists::addCommentWanted);
    connect(mForm, &QPopUpForm::delTag, this, &NoteLists::askToDelete);
    connect(mForm, &QPopUpForm::returnPopUpForm, this,
            isTagList() ? &NoteLists::returnFromTag : &NoteLists::returnFromComment);
    mForm->initForm(isTagList() ? QPopUpForm::POPUP_FORM_TAG_LIST
                                : QPopUpForm::POPUP_FORM_COMMENT_LIST,
                    mList.data());
    request();
    mForm->show();
}

void NoteLists::close()
{
    if (closeLater(mForm))
        mList.clear();
}

void NoteLists::returnFromTag()
{
    close();
}

void NoteLists::returnFromComment()
{
    close();
}

void NoteLists::refresh()
{
    if (!mList)
        return;
    PackageManager::removeCache(mProperty);
    request();
}

void NoteLists::request()
{
    if (cachedList(mProperty)) {
        listArrived(NET_SUCCESS);
        return;
    }
    if (mList->count() == 0)
        mList->showMessage(ScreenTexts::question(ScreenTexts::Loading));
    if (!PackageManager::downloadPage(mProperty, PictureDetailWidget::downloadPackageCB))
        listArrived(NET_FAILED);
}

void NoteLists::take(const PackageProperty &property, ErrorCode code)
{
    if (mList && property == mProperty)
        listArrived(code);
}

void NoteLists::listArrived(ErrorCode code)
{
    const Package *package = code == NET_SUCCESS ? cachedList(mProperty) : nullptr;
    if (package)
        mList->showNotes(isTagList() ? tagsOf(*package) : commentsOf(*package));
    if (!package)
        mList->showMessage(ScreenTexts::failure(ScreenTexts::PageFailed));
    else if (mKeys.isEmpty())
        mList->showMessage(isTagList() ? I18n::label(15)
                                       : ScreenTexts::question(ScreenTexts::NoComments));
    tellWhetherGone(package ? NET_SUCCESS : NET_FAILED);
}

QVector<NoteList::Note> NoteLists::tagsOf(const Package &package)
{
    mKeys.clear();
    for (int i = 0; i < package.count(); ++i) {
        if (const auto *record = package.record<PhotoTagList>(i))
            mKeys += record->tagList();
    }
    mKeys.removeDuplicates();
    QVector<NoteList::Note> notes;
    for (const QString &tag : qAsConst(mKeys))
        notes.append({QString(), shownText(tag).simplified(), mIsSelfPhoto});
    return notes;
}

QVector<NoteList::Note> NoteLists::commentsOf(const Package &package)
{
    QVector<const Comment *> comments;
    for (int i = 0; i < package.count(); ++i) {
        if (const auto *comment = package.record<Comment>(i))
            comments.append(comment);
    }
    std::stable_sort(comments.begin(), comments.end(), [](const Comment *a, const Comment *b) {
        return a->createdTime() > b->createdTime();
    });
    mKeys.clear();
    QVector<NoteList::Note> notes;
    for (const Comment *comment : qAsConst(comments)) {
        mKeys << comment->commentId();
        notes.append({headingOf(*comment), shownText(comment->content()).trimmed(),
                      isOwn(*comment, mProperty, mIsSelfPhoto)});
    }
    return notes;
}

void NoteLists::askToDelete(int index)
{
    if (mQuestion || index < 0 || index >= mKeys.size())
        return;
    const QString key = mKeys.at(index);
    const auto answer = [this, key](bool confirms) {
        closeLater(mQuestion);
        const int at = mKeys.indexOf(key); // the list may have changed meanwhile
        if (confirms && at >= 0)
            runDeletion(at);
    };
    if (isTagList()) {
        auto *form = new QPopUpForm(mScreen);
        form->initForm(QPopUpForm::POPUP_FORM_CONFIRM, key, QConfirm::DeleteTag);
        connect(form, &QPopUpForm::clickConfirm, this, [answer] { answer(true); });
        connect(form, &QPopUpForm::returnPopUpForm, this, [answer] { answer(false); });
        mQuestion = form;
    } else {
        auto *dialog = new QPopupDialog(mScreen);
        dialog->initDialog(ScreenTexts::question(ScreenTexts::DeleteCommentTitle),
                           ScreenTexts::question(ScreenTexts::DeleteComment),
                           {I18n::button(0), I18n::button(1)});
        connect(dialog, &QPopupDialog::accepted, this, [answer] { answer(true); });
        connect(dialog, &QPopupDialog::rejected, this, [answer] { answer(false); });
        mQuestion = dialog;
    }
    mQuestion->show();
}

void NoteLists::runDeletion(int index)
{
    QPointer<SendingNotice> notice(new SendingNotice(mScreen));
    notice->show();
    if (isTagList())
        updateTagList(index);
    else
        deleteComment(index);
    closeLater(notice); // gone already, when the screen went while it waited
}

void NoteLists::updateTagList(int index)
{
    const QPointer<NoteLists> self(this);
    const PackageProperty photo = mProperty;
    const ErrorCode code =
        PostHelper::deleteTag(photo.mUserId, photo.mAlbumId, photo.mPhotoId, mKeys.value(index));
    if (!self || code == NET_CANCELED)
        return;
    mToast->showText(I18n::prompt(code == NET_SUCCESS ? 9 : 8));
    if (code == NET_SUCCESS)
        emit changed();
}

// How it ended only the list can tell, which is fetched anew.
void NoteLists::deleteComment(int index)
{
    const QPointer<NoteLists> self(this);
    const PackageProperty photo = mProperty;
    const QString id = mKeys.value(index);
    PostHelper::deleteComment(photo.mUserId, photo.mAlbumId, photo.mPhotoId, id);
    if (!self)
        return;
    mDeletedComment = id;
    emit changed();
}

void NoteLists::tellWhetherGone(ErrorCode code)
{
    if (mDeletedComment.isEmpty())
        return;
    const bool isGone = code == NET_SUCCESS && !mKeys.contains(mDeletedComment);
    mDeletedComment.clear();
    mToast->showText(ScreenTexts::question(isGone ? ScreenTexts::CommentDeleted
                                                  : ScreenTexts::CommentNotDeleted));
}
