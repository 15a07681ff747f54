#include "ui/sliderecords.h"

#include "data/package.h"
#include "ui/homewidget.h"

#include <QLocale>

namespace sliderecords {

namespace {

// In the whole feed, of a record of the list held.
int numberOf(int record)
{
    return HomeWidget::mWidgetInst->state().firstNumber() + record;
}

} // namespace

bool hasList()
{
    return HomeWidget::mCurrentPackageData;
}

int count()
{
    return hasList() ? HomeWidget::mCurrentPackageData->count() : 0;
}

int total()
{
    return hasList() ? HomeWidget::mCurrentPackageData->mTotalCount : 0;
}

bool isMoreToCome()
{
    return HomeWidget::mWidgetInst && numberOf(count()) <= total();
}

int nextBlock(bool isRound)
{
    if (!HomeWidget::mWidgetInst || !HomeWidget::mWidgetInst->state().isSearch())
        return 0;
    if (isMoreToCome())
        return numberOf(count());
    return isRound && numberOf(0) > 1 ? 1 : 0;
}

bool isDownloading()
{
    return HomeWidget::mWidgetInst && HomeWidget::mWidgetInst->isLoading();
}

const OrvalaPhoto *photo(int record)
{
    return hasList() ? HomeWidget::mCurrentPackageData->record<OrvalaPhoto>(record) : nullptr;
}

QString url(int record)
{
    const OrvalaPhoto *wanted = photo(record);
    return wanted ? wanted->imageUrl() : QString();
}

QString caption(const OrvalaPhoto &photo)
{
    return photo.summary().trimmed().isEmpty() ? photo.title() : photo.summary();
}

QString date(const OrvalaPhoto &photo)
{
    return QLocale::c().toString(photo.published().date(), QStringLiteral("d MMMM yyyy"));
}

} // namespace sliderecords
