#include "ui/slidemarks.h"

#include "common/ui/picture.h"
#include "network/systemconfig.h"

#include <QLabel>

namespace {

constexpr QSize kArrowSize(48, 96);
constexpr int kIndicatorSize = 52;
constexpr int kIconSize = 28;

QLabel *makeArrow(const QString &picture, QWidget *screen)
{
    auto *arrow = new QLabel(screen);
    arrow->setStyleSheet(QStringLiteral("QLabel {border-image: url(%1);}").arg(picture));
    arrow->setFixedSize(kArrowSize);
    arrow->hide();
    return arrow;
}

QLabel *makeIndicator(const QString &picture, QWidget *screen)
{
    auto *indicator = new QLabel(screen);
    indicator->setStyleSheet(QStringLiteral("QLabel {background-color: rgba(11, 16, 22, 170); "
                                            "border-radius: %1px;}")
                                 .arg(kIndicatorSize / 2));
    indicator->setPixmap(loadPicture(picture, QSize(kIconSize, kIconSize)));
    indicator->setAlignment(Qt::AlignCenter);
    indicator->setFixedSize(kIndicatorSize, kIndicatorSize);
    indicator->hide();
    return indicator;
}

} // namespace

SlideMarks::SlideMarks(int seconds, QWidget *screen)
    : QObject(screen)
    , mLeft(makeArrow(QStringLiteral(":/res/left_arrow.png"), screen))
    , mRight(makeArrow(QStringLiteral(":/res/right_arrow.png"), screen))
    , mPlay(makeIndicator(QStringLiteral(":/res/icon_play.png"), screen))
    , mPause(makeIndicator(QStringLiteral(":/res/icon_pause.png"), screen))
    , mSeconds(seconds)
{
    mQuiet.setSingleShot(true);
    connect(&mQuiet, &QTimer::timeout, this, [this] {
        mIsAwake = false;
        refresh();
    });
}

void SlideMarks::place(const QSize &screen)
{
    const int middle = (screen.height() - kArrowSize.height()) / 2;
    mLeft->move(SystemConfig::borderLeft() / 2, middle);
    mRight->move(screen.width() - SystemConfig::borderRight() / 2 - kArrowSize.width(), middle);
    const QPoint bottom((screen.width() - kIndicatorSize) / 2,
                        screen.height() - SystemConfig::borderBottom() - kIndicatorSize);
    mPlay->move(bottom);
    mPause->move(bottom);
}

void SlideMarks::setArrows(bool left, bool right)
{
    mHasLeft = left;
    mHasRight = right;
    refresh();
}

void SlideMarks::setPlaying(bool isPlaying)
{
    mIsPlaying = isPlaying;
    refresh();
}

void SlideMarks::wake()
{
    mIsAwake = true;
    if (mSeconds > 0)
        mQuiet.start(mSeconds * 1000);
    refresh();
}

void SlideMarks::refresh()
{
    mLeft->setVisible(mIsAwake && mHasLeft);
    mRight->setVisible(mIsAwake && mHasRight);
    mPlay->setVisible(mIsAwake && mIsPlaying);
    mPause->setVisible(mIsAwake && !mIsPlaying);
}

bool SlideMarks::isLeftShown() const
{
    return !mLeft->isHidden();
}

bool SlideMarks::isRightShown() const
{
    return !mRight->isHidden();
}

bool SlideMarks::isPlayShown() const
{
    return !mPlay->isHidden();
}

bool SlideMarks::isPauseShown() const
{
    return !mPause->isHidden();
}
