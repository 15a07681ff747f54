#include "common/ui/keyboardpages.h"

#include <QHBoxLayout>
#include <QLabel>

namespace {

constexpr int kTextHeight = 20; // pixels of the font
constexpr int kPairGap = 24;

QString nameStyle(bool isUp)
{
    return isUp ? QStringLiteral("color:#12202b;background-color:#c5d2db;border-radius:8px;")
                : QStringLiteral("color:#a9b9c4;background-color:transparent;");
}

QLabel *makeName(QWidget *parent, KeyboardPage page)
{
    auto *name = new QLabel(parent);
    name->setTextFormat(Qt::PlainText);
    name->setText(pageName(page));
    name->setAlignment(Qt::AlignCenter);
    QFont font = name->font();
    font.setPixelSize(kTextHeight);
    font.setBold(true);
    name->setFont(font);
    name->setStyleSheet(nameStyle(false));
    return name;
}

} // namespace

KeyboardPages::KeyboardPages(QWidget *parent)
    : QWidget(parent)
{
    auto *row = new QHBoxLayout(this);
    row->setContentsMargins(0, 0, 0, 0);
    row->setSpacing(4);
    for (int i = 0; i < kPageCount; ++i) {
        if (i > 0 && i % 2 == 0)
            row->addSpacing(kPairGap);
        QLabel *name = makeName(this, KeyboardPage(i));
        row->addWidget(name, 1);
        mNames << name;
    }
}

void KeyboardPages::setPage(KeyboardPage page)
{
    for (int i = 0; i < mNames.size(); ++i) {
        const QString wanted = nameStyle(i == int(page));
        if (mNames.at(i)->styleSheet() != wanted)
            mNames.at(i)->setStyleSheet(wanted);
    }
}
