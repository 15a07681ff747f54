#include "ui/noteinput.h"

#include "base/i18n.h"
#include "common/ui/closelater.h"
#include "common/ui/qpopupform.h"
#include "common/ui/qtoastwidget.h"
#include "data/posthelper.h"
#include "ui/sendingnotice.h"

namespace {

enum PromptText {
    EmptyPrompt = 4,
    FailedPrompt = 6,
    PostedPrompt = 7,
    SilentPrompt = 11,
    ForbiddenPrompt = 12
};

int promptFor(ErrorCode code)
{
    switch (code) {
    case NET_SUCCESS:
        return PostedPrompt;
    case NET_NOT_PERMITTED:
    case NET_CONTENT_ERROR:
        return ForbiddenPrompt;
    case NET_TIMEOUT:
    case NET_REFUSED:
    case NET_HOST_NOT_FOUND:
        return SilentPrompt;
    default:
        return FailedPrompt;
    }
}

} // namespace

NoteInput::NoteInput(QWidget *screen, QToastWidget *toast)
    : QObject(screen)
    , mScreen(screen)
    , mToast(toast)
{
}

void NoteInput::showInputCommentDialog(const PackageProperty &photo)
{
    open(QPopUpForm::POPUP_FORM_COMMENT_INPUT, photo);
}

void NoteInput::showInputTagDialog(const PackageProperty &photo)
{
    open(QPopUpForm::POPUP_FORM_TAG_INPUT, photo);
}

void NoteInput::open(int kind, const PackageProperty &photo)
{
    if (mKeyboard || photo.mPhotoId.isEmpty())
        return;
    mPhoto = photo;
    mIsTag = kind == QPopUpForm::POPUP_FORM_TAG_INPUT;
    mKeyboard = new QPopUpForm(mScreen);
    mKeyboard->initForm(kind);
    connect(mKeyboard, &QPopUpForm::editFinished, this,
            &NoteInput::returnFromInputDialogWithString);
    connect(mKeyboard, &QPopUpForm::returnPopUpForm, this, &NoteInput::returnFromInputDialog);
    mKeyboard->show();
}

void NoteInput::returnFromInputDialog()
{
    closeLater(mKeyboard);
}

void NoteInput::returnFromInputDialogWithString(QString text)
{
    if (text.trimmed().isEmpty())
        mToast->showText(I18n::prompt(EmptyPrompt));
    else
        postCommentOrTag(text.trimmed());
}

void NoteInput::postCommentOrTag(QString text)
{
    QPointer<SendingNotice> notice(new SendingNotice(mScreen));
    notice->show();
    const QPointer<NoteInput> self(this);
    const ErrorCode code = send(text);
    closeLater(notice);
    if (!self)
        return; // the screen went while it waited
    if (code == NET_SUCCESS)
        returnFromInputDialog();
    if (code != NET_CANCELED)
        mToast->showText(I18n::prompt(promptFor(code)));
    if (code == NET_SUCCESS)
        emit posted();
}

ErrorCode NoteInput::send(QString text) const
{
    const PackageProperty photo = mPhoto;
    return mIsTag ? PostHelper::addTag(photo.mUserId, photo.mAlbumId, photo.mPhotoId, text)
                  : PostHelper::addComment(photo.mUserId, photo.mAlbumId, photo.mPhotoId, text);
}
