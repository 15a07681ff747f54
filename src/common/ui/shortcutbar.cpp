#include "common/ui/shortcutbar.h"

#include "common/ui/picture.h"
#include "common/ui/remotekeys.h"

#include <QHBoxLayout>
#include <QLabel>
#include <QPixmap>

namespace {

constexpr int kTextHeight = 18; // pixels of the font

struct Cap
{
    int key;
    const char *picture;
};

const Cap kCaps[] = {
    {DEVICE_SELECT_KEY, ":/res/hint_select.png"},
    {DEVICE_RETURN_KEY, ":/res/hint_return.png"},
    {DEVICE_DOWN_KEY, ":/res/hint_down.png"},
    {DEVICE_PAGEUP_KEY, ":/res/hint_page_up.png"},
    {DEVICE_PAGEDOWN_KEY, ":/res/hint_page_down.png"},
    {DEVICE_PLAY_KEY, ":/res/hint_play.png"},
    {DEVICE_PAUSE_KEY, ":/res/hint_pause.png"},
    {DEVICE_PRE_KEY, ":/res/hint_previous.png"},
    {DEVICE_NEXT_KEY, ":/res/hint_next.png"},
    {DEVICE_SETTING_KEY, ":/res/hint_setting.png"},
    {DEVICE_RED_KEY, ":/res/hint_red.png"},
};

QPixmap pictureOf(int key)
{
    for (const Cap &cap : kCaps) {
        if (cap.key == key)
            return loadPicture(QString::fromLatin1(cap.picture));
    }
    return QPixmap();
}

QLabel *makeLabel(QWidget *parent, const QString &text)
{
    auto *label = new QLabel(parent);
    label->setTextFormat(Qt::PlainText);
    label->setText(text);
    QFont font = label->font();
    font.setPixelSize(kTextHeight);
    label->setFont(font);
    // Not by a style sheet, which would keep the font that the program starts with.
    QPalette palette = label->palette();
    palette.setColor(QPalette::WindowText, QColor(0xc5, 0xd2, 0xdb));
    label->setPalette(palette);
    return label;
}

QLabel *makeCap(QWidget *parent, int key)
{
    auto *cap = new QLabel(parent);
    cap->setPixmap(pictureOf(key));
    return cap;
}

} // namespace

ShortcutBar::ShortcutBar(QWidget *parent)
    : QWidget(parent)
    , mRow(new QHBoxLayout(this))
{
    mRow->setContentsMargins(0, 0, 0, 0);
    mRow->setSpacing(24);
    mRow->addStretch();
}

void ShortcutBar::addEntry(int key, const QString &text)
{
    auto *entry = new QWidget(this);
    auto *row = new QHBoxLayout(entry);
    row->setContentsMargins(0, 0, 0, 0);
    row->setSpacing(8);
    row->addWidget(makeCap(entry, key));
    QLabel *label = makeLabel(entry, text);
    row->addWidget(label);
    mRow->addWidget(entry);
    mEntries.insert(key, {entry, label});
}

void ShortcutBar::setText(int key, const QString &text)
{
    if (mEntries.contains(key))
        mEntries[key].text->setText(text);
}

void ShortcutBar::setShown(int key, bool shown)
{
    if (mEntries.contains(key))
        mEntries[key].widget->setVisible(shown);
}

void ShortcutBar::showOnly(const QList<int> &keys)
{
    for (auto entry = mEntries.cbegin(); entry != mEntries.cend(); ++entry)
        entry->widget->setVisible(keys.contains(entry.key()));
}

bool ShortcutBar::isShown(int key) const
{
    return mEntries.contains(key) && !mEntries[key].widget->isHidden();
}

QString ShortcutBar::text(int key) const
{
    return mEntries.contains(key) ? mEntries[key].text->text() : QString();
}
