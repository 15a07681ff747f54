#include "accountmanager/waitwidget.h"

#include "base/i18n.h"
#include "common/ui/qprogressindicator.h"
#include "common/ui/remotekeys.h"
#include "common/ui/screenbackground.h"

#include <QKeyEvent>
#include <QLabel>
#include <QVBoxLayout>

WaitWidget::WaitWidget(QWidget *parent)
    : QWidget(parent)
{
    setFocusPolicy(Qt::StrongFocus);
    auto *ring = new QProgressIndicator(this);
    ring->startAnimation();
    auto *label = new QLabel(this);
    label->setTextFormat(Qt::PlainText);
    label->setText(I18n::prompt(2));
    label->setStyleSheet(QStringLiteral("color: white; font-size: 28px;"));

    auto *column = new QVBoxLayout(this);
    column->setSpacing(24);
    column->addStretch();
    column->addWidget(ring, 0, Qt::AlignHCenter);
    column->addWidget(label, 0, Qt::AlignHCenter);
    column->addStretch();
}

void WaitWidget::keyPressEvent(QKeyEvent *event)
{
    if (event->key() == DEVICE_RETURN_KEY)
        emit returnClicked();
    else
        event->ignore();
}

void WaitWidget::resizeEvent(QResizeEvent *)
{
    setScreenBackground(this);
}
