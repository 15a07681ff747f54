#include "common/ui/qtoastwidget.h"

#include "common/ui/textfit.h"
#include "network/systemconfig.h"

#include <QLabel>
#include <QTimerEvent>
#include <QVBoxLayout>

QToastWidget::QToastWidget(QWidget *parent)
    : QWidget(parent)
    , mLabel(new QLabel(this))
{
    hide();
    setAttribute(Qt::WA_TransparentForMouseEvents);
    mLabel->setTextFormat(Qt::PlainText);
    mLabel->setAlignment(Qt::AlignCenter);
    QFont font = mLabel->font();
    font.setPointSize(SystemConfig::menuFont());
    mLabel->setFont(font);
    mLabel->setStyleSheet(QStringLiteral("border-image:url(%1);border-width: 0px;color:black;")
                              .arg(QStringLiteral(":/res/ToastWin_Bg.png")));
    mLabel->setFixedHeight(SystemConfig::mScreen_Height / 3);
    auto *layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(mLabel);
    if (parent)
        parent->installEventFilter(this);
}

void QToastWidget::showText(const QString &text, int milliseconds)
{
    place();
    // What the picture's panel has room for.
    const QSize box(width() * 2 / 3, mLabel->height() / 2);
    mLabel->setText(fitText(text, mLabel->font(), box));
    show();
    raise();
    mTimer.start(milliseconds, this);
}

QString QToastWidget::text() const
{
    return mLabel->text();
}

void QToastWidget::place()
{
    const QSize below = parentWidget()
                            ? parentWidget()->size()
                            : QSize(SystemConfig::mScreen_Width, SystemConfig::mScreen_Height);
    const int height = mLabel->maximumHeight();
    setGeometry(0, (below.height() - height) / 2, below.width(), height);
}

bool QToastWidget::eventFilter(QObject *watched, QEvent *event)
{
    if (watched == parent() && event->type() == QEvent::Resize)
        place();
    return QWidget::eventFilter(watched, event);
}

void QToastWidget::timerEvent(QTimerEvent *event)
{
    if (event->timerId() != mTimer.timerId()) {
        QWidget::timerEvent(event);
        return;
    }
    mTimer.stop();
    hide();
    emit finished();
}
