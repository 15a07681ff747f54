#include "ui/sendingnotice.h"

#include "base/i18n.h"
#include "common/ui/frames.h"
#include "common/ui/qprogressindicator.h"
#include "common/ui/remotekeys.h"
#include "data/posthelper.h"

#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>

SendingNotice::SendingNotice(QWidget *screen)
    : PopupOverlay(screen)
{
    auto *panel = new QContentFrame(this, QContentFrame::Place::Alone);
    auto *row = new QHBoxLayout(panel);
    row->setContentsMargins(48, 32, 48, 32);
    row->setSpacing(24);
    auto *indicator = new QProgressIndicator(panel);
    indicator->startAnimation();
    row->addWidget(indicator);
    auto *text = new QLabel(panel);
    text->setTextFormat(Qt::PlainText);
    text->setText(I18n::prompt(5));
    QFont font = text->font();
    font.setPixelSize(26);
    text->setFont(font);
    setPopupColours(text);
    row->addWidget(text);
    setPanel(panel);
}

void SendingNotice::keyPressEvent(QKeyEvent *event)
{
    event->accept();
    if (event->key() == DEVICE_RETURN_KEY)
        PostHelper::cancel();
}
