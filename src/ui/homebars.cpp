#include "ui/homebars.h"

#include "base/i18n.h"
#include "common/ui/remotekeys.h"
#include "common/ui/shortcutbar.h"
#include "ui/informationline.h"
#include "ui/paging.h"
#include "ui/screentexts.h"

#include <QHBoxLayout>

namespace {

// Every key that has a hint, in the order of their places.
const int kKeys[] = {DEVICE_SELECT_KEY,   DEVICE_DOWN_KEY,   DEVICE_PLAY_KEY, DEVICE_PAGEUP_KEY,
                     DEVICE_PAGEDOWN_KEY, DEVICE_RETURN_KEY, DEVICE_RED_KEY};

HomeBars::Hints gridHints(const HomeState &state, const Package *package)
{
    HomeBars::Hints hints{{DEVICE_SELECT_KEY, ScreenTexts::hint(ScreenTexts::OpenHint)}};
    const int start = state.mCurrentProperty.mStartIndex;
    if (state.isPhotoList())
        hints << qMakePair(int(DEVICE_PLAY_KEY), I18n::shortCut(9));
    if (paging::pageUp(start, paging::onePage).exists)
        hints << qMakePair(int(DEVICE_PAGEUP_KEY), I18n::shortCut(0));
    if (paging::pageDown(start, state.total(package), paging::onePage).exists)
        hints << qMakePair(int(DEVICE_PAGEDOWN_KEY), I18n::shortCut(1));
    return hints;
}

} // namespace

HomeBars::HomeBars(QWidget *parent)
    : QWidget(parent)
    , mInformation(new InformationLine(this))
    , mShortcuts(new ShortcutBar(this))
{
    auto *row = new QHBoxLayout(this);
    row->setContentsMargins(0, 0, 0, 0);
    row->setSpacing(24);
    setFixedHeight(32);
    QSizePolicy policy = sizePolicy();
    policy.setRetainSizeWhenHidden(true); // nothing else moves when it goes
    setSizePolicy(policy);
    row->addWidget(mInformation, 1);
    row->addWidget(mShortcuts);
    for (int key : kKeys)
        mShortcuts->addEntry(key, QString());
}

HomeBars::Hints HomeBars::usefulKeys(const HomeState &state, HomePages::Page page,
                                     const Package *package)
{
    if (page == HomePages::Loading)
        return {};
    Hints hints;
    if (page == HomePages::Grid)
        hints = gridHints(state, package);
    else if (page == HomePages::Failure)
        hints << qMakePair(int(DEVICE_SELECT_KEY), ScreenTexts::hint(ScreenTexts::RetryHint));
    if (page == HomePages::Failure || state.back() != HomeState::Back::SignOut)
        hints << qMakePair(int(DEVICE_RETURN_KEY), I18n::shortCut(2));
    hints << qMakePair(int(DEVICE_RED_KEY), I18n::shortCut(10));
    return hints;
}

void HomeBars::setInformation(const QString &title, const QString &position)
{
    mInformation->setTexts(title, position);
}

QString HomeBars::information() const
{
    return mInformation->text();
}

void HomeBars::showHints(const Hints &hints)
{
    QList<int> keys;
    for (const auto &hint : hints) {
        mShortcuts->setText(hint.first, hint.second);
        keys << hint.first;
    }
    mShortcuts->showOnly(keys);
}
