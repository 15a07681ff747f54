#include "ui/homebars.h"

#include "base/i18n.h"
#include "common/ui/remotekeys.h"
#include "common/ui/shortcutbar.h"
#include "ui/informationline.h"
#include "ui/screentexts.h"

#include <QHBoxLayout>

HomeBars::HomeBars(QWidget *parent)
    : QWidget(parent)
    , mInformation(new InformationLine(this))
    , mShortcuts(new ShortcutBar(this))
{
    auto *row = new QHBoxLayout(this);
    row->setContentsMargins(10, 0, 10, 0);
    row->setSpacing(24);
    setFixedHeight(32);
    row->addWidget(mInformation, 1);
    row->addWidget(mShortcuts);
    mShortcuts->addEntry(DEVICE_SELECT_KEY, ScreenTexts::hint(ScreenTexts::OpenHint));
    mShortcuts->addEntry(DEVICE_PLAY_KEY, I18n::shortCut(9));
    mShortcuts->addEntry(DEVICE_PAGEUP_KEY, I18n::shortCut(0));
    mShortcuts->addEntry(DEVICE_PAGEDOWN_KEY, I18n::shortCut(1));
    mShortcuts->addEntry(DEVICE_RETURN_KEY, I18n::shortCut(2));
    mShortcuts->addEntry(DEVICE_RED_KEY, I18n::shortCut(10));
}

void HomeBars::setInformation(const QString &title, const QString &position)
{
    mInformation->setTexts(title, position);
}

QString HomeBars::information() const
{
    return mInformation->text();
}

void HomeBars::showKeys(const QList<int> &keys)
{
    mShortcuts->showOnly(keys);
}

bool HomeBars::isKeyShown(int key) const
{
    return mShortcuts->isShown(key);
}
