#include "ui/accountquestions.h"

#include "base/i18n.h"
#include "common/ui/closelater.h"
#include "common/ui/qconfirm.h"
#include "common/ui/qpopupdialog.h"
#include "common/ui/qpopupform.h"
#include "ui/screentexts.h"

AccountQuestions::AccountQuestions(QWidget *screen)
    : QObject(screen)
    , mScreen(screen)
{
}

void AccountQuestions::askToSignOut()
{
    if (mQuestion)
        return;
    auto *form = new QPopUpForm(mScreen); // for its Return key
    form->initForm(QPopUpForm::POPUP_FORM_CONFIRM, QString(), QConfirm::SignOut);
    connect(form, &QPopUpForm::clickConfirm, this, [this] { answer(true); });
    connect(form, &QPopUpForm::returnPopUpForm, this, [this] { answer(false); });
    show(form);
}

void AccountQuestions::askAfterRefusal(const QString &reason)
{
    if (mQuestion)
        return;
    auto *dialog = new QPopupDialog(mScreen);
    dialog->initDialog(I18n::title(11),
                       reason + QLatin1Char('\n') + ScreenTexts::question(ScreenTexts::SignInAgain),
                       {I18n::button(0), I18n::button(1)});
    connect(dialog, &QPopupDialog::accepted, this, [this] { answer(true); });
    connect(dialog, &QPopupDialog::rejected, this, [this] { answer(false); });
    show(dialog);
}

void AccountQuestions::show(QWidget *question)
{
    mQuestion = question;
    question->show();
}

void AccountQuestions::answer(bool confirms)
{
    closeLater(mQuestion);
    if (confirms)
        emit confirmed();
    else
        emit canceled();
}
