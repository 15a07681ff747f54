#include "common/ui/keyboardpages.h"

#include <QGridLayout>
#include <QLabel>

namespace {

constexpr int kTextHeight = 20; // pixels of the font

QString nameStyle(bool isUp)
{
    return isUp ? QStringLiteral("color:#12202b;background-color:#c5d2db;border:2px solid #f2f6f9;"
                                 "border-radius:8px;font-weight:bold;")
                : QStringLiteral("color:#c5d2db;background-color:transparent;"
                                 "border:2px solid #3e4c58;border-radius:8px;");
}

} // namespace

KeyboardPages::KeyboardPages(QWidget *parent)
    : QWidget(parent)
{
    auto *grid = new QGridLayout(this);
    grid->setContentsMargins(0, 0, 0, 0);
    grid->setSpacing(8);
    for (int i = 0; i < kPageCount; ++i) {
        auto *name = new QLabel(this);
        name->setTextFormat(Qt::PlainText);
        name->setText(pageName(KeyboardPage(i)));
        name->setAlignment(Qt::AlignCenter);
        QFont font = name->font();
        font.setPixelSize(kTextHeight);
        name->setFont(font);
        name->setFixedSize(104, 38);
        name->setStyleSheet(nameStyle(false));
        grid->addWidget(name, i / 2, i % 2);
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
