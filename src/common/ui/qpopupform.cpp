#include "common/ui/qpopupform.h"

#include "base/i18n.h"
#include "base/log.h"
#include "common/ui/dialogpanel.h"
#include "common/ui/frames.h"
#include "common/ui/qconfirm.h"
#include "common/ui/qkeyboardinput.h"
#include "common/ui/qpopuplist.h"
#include "common/ui/remotekeys.h"

#include <QKeyEvent>
#include <QLabel>
#include <QVBoxLayout>

namespace {

// Whether the kind is one of the inputs.
bool isInput(int kind)
{
    return kind >= QPopUpForm::POPUP_FORM_COMMENT_INPUT &&
           kind <= QPopUpForm::POPUP_FORM_TEXT_INPUT;
}

bool isList(int kind)
{
    return kind == QPopUpForm::POPUP_FORM_TAG_LIST || kind == QPopUpForm::POPUP_FORM_COMMENT_LIST;
}

const char *nameOf(int kind)
{
    static const char *const names[] = {
        "POPUP_FORM_TAG_LIST",  "POPUP_FORM_COMMENT_LIST", "POPUP_FORM_COMMENT_INPUT",
        "POPUP_FORM_TAG_INPUT", "POPUP_FORM_SEARCH_INPUT", "POPUP_FORM_TEXT_INPUT",
    };
    return names[kind];
}

QString titleOf(int kind)
{
    switch (kind) {
    case QPopUpForm::POPUP_FORM_TAG_LIST:
        return I18n::title(3);
    case QPopUpForm::POPUP_FORM_COMMENT_LIST:
        return I18n::title(7);
    case QPopUpForm::POPUP_FORM_COMMENT_INPUT:
        return I18n::title(6);
    case QPopUpForm::POPUP_FORM_TAG_INPUT:
        return I18n::title(4);
    case QPopUpForm::POPUP_FORM_SEARCH_INPUT:
        return I18n::label(9);
    default:
        return I18n::title(9);
    }
}

} // namespace

QPopUpForm::QPopUpForm(QWidget *parent)
    : PopupOverlay(parent)
{
    qRegisterMetaType<int32_t>("int32_t"); // as the signals name it
}

void QPopUpForm::initForm(int kind, const QString &text, int confirmType)
{
    if (isInput(kind))
        initInput(kind, text);
    else if (kind == POPUP_FORM_CONFIRM)
        initConfirm(confirmType, text);
    else
        logLine("Wrong QPopUpForm::initForm()");
}

void QPopUpForm::initForm(int kind, QPopUpList *list)
{
    if (!isList(kind) || !list) {
        logLine("Wrong QPopUpForm::initForm()");
        delete list;
        return;
    }
    logLine("<initForm> ", nameOf(kind));
    connect(list, &QPopUpList::returnList, this, &QPopUpForm::handleReturn);
    connect(list, &QPopUpList::delItem, this, &QPopUpForm::handleDelItem);
    connect(list, &QPopUpList::switchProfile, this, &QPopUpForm::handleSwitchProfile);
    connect(list, &QPopUpList::shareComment, this, &QPopUpForm::handleShareComment);
    wrap(list, kind);
}

void QPopUpForm::initInput(int kind, const QString &text)
{
    logLine("<initForm> ", nameOf(kind));
    auto *input = new QKeyBoardInput(this);
    input->setMultiLine(kind == POPUP_FORM_COMMENT_INPUT);
    input->setText(text);
    connect(input, &QKeyBoardInput::inputFinished, this, &QPopUpForm::handleInput);
    connect(input, &QKeyBoardInput::returnClicked, this, &QPopUpForm::handleReturn);
    mInput = input;
    wrap(input, kind);
}

void QPopUpForm::initConfirm(int type, const QString &text)
{
    auto *confirm = new QConfirm(this);
    confirm->init(type, text);
    connect(confirm, &QConfirm::clickConfirm, this, &QPopUpForm::handleClickConfirm);
    connect(confirm, &QConfirm::clickCancel, this, &QPopUpForm::handleReturn);
    confirm->installEventFilter(this);
    setPanel(confirm);
    host(confirm);
}

// Puts a title above the form and a frame around it.
void QPopUpForm::wrap(QWidget *form, int kind)
{
    auto *panel = new QFrame(this);
    auto *content = new QContentFrame(panel);
    auto *inner = new QVBoxLayout(content);
    inner->setContentsMargins(0, 0, 0, 0);
    inner->addWidget(form);
    auto *rows = new QVBoxLayout(panel);
    rows->setContentsMargins(0, 0, 0, 0);
    rows->setSpacing(0);
    QLabel *title = makePopupTitle(panel);
    title->setText(titleOf(kind));
    rows->addWidget(title);
    rows->addWidget(content);
    setPanel(panel);
    host(form);
}

void QPopUpForm::host(QWidget *form)
{
    mHosted = form;
    if (isVisible() && focusPolicy() != Qt::NoFocus)
        form->setFocus();
}

QWidget *QPopUpForm::focusReceiver()
{
    return mHosted ? mHosted.data() : this;
}

void QPopUpForm::setInputMode(bool isPassword)
{
    if (mInput)
        mInput->setInputMode(isPassword);
}

void QPopUpForm::handleInput(QString text)
{
    logLine("<QPopUpForm::handleInput> texts = ", text);
    emit editFinished(text);
}

void QPopUpForm::handleReturn()
{
    emit returnPopUpForm();
}

void QPopUpForm::handleClickConfirm()
{
    emit clickConfirm();
}

void QPopUpForm::handleSwitchProfile(int32_t index)
{
    emit switchProgile(index);
}

void QPopUpForm::handleShareComment(QString &text)
{
    emit shareClicked(text);
}

void QPopUpForm::handleDelItem(int index)
{
    emit delTag(index);
}

// A question leaves no key to its form, but Return answers it as well.
bool QPopUpForm::eventFilter(QObject *watched, QEvent *event)
{
    const bool isReturn = watched == mHosted && event->type() == QEvent::KeyPress &&
                          static_cast<QKeyEvent *>(event)->key() == DEVICE_RETURN_KEY;
    if (!isReturn)
        return PopupOverlay::eventFilter(watched, event);
    handleReturn();
    return true;
}

// What the hosted form leaves: its user must always find the way back.
void QPopUpForm::keyPressEvent(QKeyEvent *event)
{
    event->accept();
    if (event->key() == DEVICE_RETURN_KEY)
        handleReturn();
}
