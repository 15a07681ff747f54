#include "common/ui/shortcutbar.h"

#include "common/ui/picture.h"
#include "common/ui/remotekeys.h"

#include <QHBoxLayout>
#include <QKeySequence>
#include <QLabel>
#include <QPixmap>

namespace {

constexpr int kTextHeight = 18; // pixels of the font
constexpr int kCapHeight = 28;

struct Cap
{
    int key;
    const char *picture;
};

const Cap kCaps[] = {
    {DEVICE_SELECT_KEY, ":/res/hint_select.png"},
    {DEVICE_RETURN_KEY, ":/res/hint_return.png"},
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
    return label;
}

QLabel *makeCap(QWidget *parent, int key)
{
    const QPixmap picture = pictureOf(key);
    if (picture.isNull()) {
        QLabel *cap = makeLabel(parent, QKeySequence(key).toString());
        cap->setStyleSheet(QStringLiteral("color:#f2f6f9;background-color:#2a3641;border:2px solid "
                                          "#9fb0bc;border-radius:7px;padding:0px 6px;"));
        cap->setFixedHeight(kCapHeight);
        return cap;
    }
    auto *cap = new QLabel(parent);
    cap->setPixmap(picture);
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
    // No style sheet: a label with one keeps the family that was the program's before its font
    // came.
    QPalette colours = label->palette();
    colours.setColor(QPalette::WindowText, QColor(0xc5, 0xd2, 0xdb));
    label->setPalette(colours);
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
