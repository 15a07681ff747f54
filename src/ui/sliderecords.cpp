#include "ui/sliderecords.h"

#include "data/package.h"
#include "ui/homewidget.h"

#include <QLocale>

namespace sliderecords {

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
    return QLocale().toString(photo.published().date(), QStringLiteral("d MMMM yyyy"));
}

} // namespace sliderecords
