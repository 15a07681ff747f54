#include "ui/contentpages.h"

#include "base/i18n.h"
#include "common/ui/picture.h"
#include "common/ui/qprogressindicator.h"
#include "common/ui/remotekeys.h"
#include "ui/screentexts.h"

#include <QKeyEvent>
#include <QLabel>
#include <QVBoxLayout>

namespace {

QVBoxLayout *makeColumn(QWidget *page)
{
    page->setFocusPolicy(Qt::StrongFocus);
    auto *column = new QVBoxLayout(page);
    column->setContentsMargins(0, 0, 0, 0);
    column->setSpacing(16);
    column->addStretch();
    return column;
}

void addPicture(QVBoxLayout *column, const QString &resource)
{
    auto *picture = new QLabel(column->parentWidget());
    picture->setPixmap(loadPicture(resource));
    column->addWidget(picture, 0, Qt::AlignCenter);
}

QLabel *addLine(QVBoxLayout *column, const QString &text, int pixels, const QString &colour)
{
    auto *label = new QLabel(column->parentWidget());
    label->setTextFormat(Qt::PlainText);
    label->setText(text);
    label->setAlignment(Qt::AlignCenter);
    label->setStyleSheet(QStringLiteral("color:") + colour);
    QFont font = label->font();
    font.setPixelSize(pixels);
    label->setFont(font);
    column->addWidget(label);
    return label;
}

ScreenTexts::Failure reasonOf(ErrorCode code)
{
    switch (code) {
    case NET_CONTENT_ERROR:
        return ScreenTexts::PageNotFound;
    case NET_TIMEOUT:
        return ScreenTexts::PageTooSlow;
    case NET_REFUSED:
    case NET_HOST_NOT_FOUND:
        return ScreenTexts::NoConnection;
    case NET_NOT_PERMITTED:
        return ScreenTexts::PageRefused;
    default:
        return ScreenTexts::PageFailed;
    }
}

} // namespace

LoadingPage::LoadingPage(QWidget *parent)
    : QWidget(parent)
{
    QVBoxLayout *column = makeColumn(this);
    mIndicator = new QProgressIndicator(this);
    column->addWidget(mIndicator, 0, Qt::AlignCenter);
    column->addStretch();
}

void LoadingPage::start()
{
    mIndicator->startAnimation();
}

void LoadingPage::stop()
{
    mIndicator->stopAnimation();
}

NoPhotoAvailableWidget::NoPhotoAvailableWidget(QWidget *parent)
    : QWidget(parent)
{
    QVBoxLayout *column = makeColumn(this);
    addPicture(column, QStringLiteral(":/res/icon_photo.png"));
    addLine(column, I18n::prompt(15), 28, QStringLiteral("#e6edf2"));
    column->addStretch();
    setFocusPolicy(Qt::NoFocus);
}

FailurePage::FailurePage(QWidget *parent)
    : QWidget(parent)
{
    QVBoxLayout *column = makeColumn(this);
    addPicture(column, QStringLiteral(":/res/icon_offline.png"));
    mReason = addLine(column, QString(), 28, QStringLiteral("#e6edf2"));
    addLine(column, ScreenTexts::failure(ScreenTexts::HowToGoOn), 22, QStringLiteral("#a2bbc9"));
    column->addStretch();
}

void FailurePage::setReason(ErrorCode code)
{
    mReason->setText(ScreenTexts::failure(reasonOf(code)));
}

QString FailurePage::reason() const
{
    return mReason->text();
}

void FailurePage::keyPressEvent(QKeyEvent *event)
{
    event->accept();
    if (event->key() == DEVICE_SELECT_KEY)
        emit retryRequested();
    else if (event->key() == DEVICE_RETURN_KEY)
        emit leaveRequested();
    else
        event->ignore();
}
