#include "ui/searchflow.h"

#include "base/log.h"
#include "common/ui/closelater.h"
#include "common/ui/qpopupform.h"
#include "data/packagemanager.h"
#include "ui/cellfiller.h"
#include "ui/homepages.h"
#include "ui/homestate.h"
#include "ui/searchwidget.h"

SearchFlow::SearchFlow(HomeState *state, HomePages *pages, QWidget *screen)
    : QObject(screen)
    , mState(state)
    , mPages(pages)
    , mScreen(screen)
{
    const SearchWidget *bar = pages->searchBar();
    connect(bar, &SearchWidget::showInputDialog, this, &SearchFlow::showInputCommentDialog);
    connect(bar, &SearchWidget::startSearch, this, &SearchFlow::handleStartSearch);
}

void SearchFlow::open()
{
    mPages->searchBar()->setText(QString());
    showBar();
}

// The words stay: they are what the user most likely wants to change.
void SearchFlow::backToBar()
{
    logLine("{keyPressEvent} SEARCH_PHOTOS_LIST");
    mState->backToSearchBar();
    showBar();
}

void SearchFlow::showBar()
{
    CellFiller::cancelThumbnails();
    mPages->show(HomePages::Search);
    mPages->focusPage();
}

void SearchFlow::showInputCommentDialog()
{
    if (mKeyboard)
        return;
    mKeyboard = new QPopUpForm(mScreen);
    mKeyboard->initForm(QPopUpForm::POPUP_FORM_SEARCH_INPUT, mPages->searchBar()->text());
    connect(mKeyboard, &QPopUpForm::editFinished, this, &SearchFlow::takeWords);
    connect(mKeyboard, &QPopUpForm::returnPopUpForm, this, [this] { closeLater(mKeyboard); });
    mKeyboard->show();
}

void SearchFlow::takeWords(const QString &text)
{
    mPages->searchBar()->setText(text.simplified());
    closeLater(mKeyboard);
}

void SearchFlow::handleStartSearch(QString text)
{
    mState->startSearch(text);
    emit resultsWanted();
}

bool SearchFlow::changeBlock(bool next)
{
    if (!mState->changeBlock(next))
        return false;
    // All blocks share one place in the cache, which does not tell whose records it holds.
    PackageManager::removeCache(mState->mCurrentProperty);
    emit resultsWanted();
    return true;
}
