#include "common/ui/keymap.h"

#include "base/log.h"
#include "common/ui/remotekeys.h"
#include "network/systemconfig.h"

#include <QApplication>
#include <QKeySequence>
#include <QMetaEnum>
#include <QWidget>

namespace {

constexpr char takesTextProperty[] = "takesText";

// The number after "scan:", 0 when the name is none.
quint32 scanCode(const QString &name)
{
    const QLatin1String prefix("scan:");
    return name.startsWith(prefix) ? name.midRef(prefix.size()).toUInt() : 0;
}

// 0 when Qt knows no such key.
int physicalKey(const QString &name)
{
    const QByteArray enumerator = "Key_" + name.toLatin1();
    bool isKnown = false;
    const int key = QMetaEnum::fromType<Qt::Key>().keyToValue(enumerator.constData(), &isKnown);
    if (isKnown)
        return key;
    const QKeySequence sequence = QKeySequence::fromString(name, QKeySequence::PortableText);
    return sequence.count() == 1 && sequence[0] != Qt::Key_unknown ? sequence[0] : 0;
}

bool types(const QKeyEvent &event)
{
    return event.key() == Qt::Key_Backspace || event.key() == Qt::Key_Delete ||
           (!event.text().isEmpty() && event.text().at(0).isPrint());
}

bool focusTakesText()
{
    const QWidget *focus = QApplication::focusWidget();
    return focus && focus->property(takesTextProperty).toBool();
}

} // namespace

KeyMap::KeyMap(const Entries &entries)
{
    for (auto entry = entries.cbegin(); entry != entries.cend(); ++entry)
        add(entry.key().trimmed(), entry.value().trimmed());
}

KeyMap KeyMap::fromConfiguration()
{
    const QString group = QStringLiteral("Keys");
    Entries entries;
    for (const QString &key : SystemConfig::keysOf(group))
        entries.insert(key, SystemConfig::value(group + QLatin1Char('/') + key));
    return KeyMap(entries);
}

const KeyMap &KeyMap::instance()
{
    static const KeyMap map = fromConfiguration();
    return map;
}

void KeyMap::add(const QString &physical, const QString &remote)
{
    const int target = remoteKey(remote);
    if (target < 0) {
        logLine("KeyMap: the remote has no key ", remote, " (for ", physical, ")");
        return;
    }
    if (const quint32 code = scanCode(physical)) {
        mScanCodes.insert(code, target);
        return;
    }
    if (const int key = physicalKey(physical))
        mKeys.insert(key, target);
    else
        logLine("KeyMap: unknown key ", physical, " (for ", remote, ")");
}

int KeyMap::remoteKey(const QString &name)
{
    static const QHash<QString, int> codes = {
        {QStringLiteral("up"), DEVICE_UP_KEY},
        {QStringLiteral("down"), DEVICE_DOWN_KEY},
        {QStringLiteral("left"), DEVICE_LEFT_KEY},
        {QStringLiteral("right"), DEVICE_RIGHT_KEY},
        {QStringLiteral("select"), DEVICE_SELECT_KEY},
        {QStringLiteral("return"), DEVICE_RETURN_KEY},
        {QStringLiteral("play"), DEVICE_PLAY_KEY},
        {QStringLiteral("playpause"), DEVICE_PLAYPAUSE_KEY},
        {QStringLiteral("pause"), DEVICE_PAUSE_KEY},
        {QStringLiteral("previous"), DEVICE_PRE_KEY},
        {QStringLiteral("next"), DEVICE_NEXT_KEY},
        {QStringLiteral("pageup"), DEVICE_PAGEUP_KEY},
        {QStringLiteral("pagedown"), DEVICE_PAGEDOWN_KEY},
        {QStringLiteral("red"), DEVICE_RED_KEY},
        {QStringLiteral("setting"), DEVICE_SETTING_KEY},
        {QStringLiteral("clear"), DEVICE_CLEAR_KEY},
        {QStringLiteral("exit"), DEVICE_EXIT_KEY},
        {QStringLiteral("mediacenter"), MEDIA_CENTER_KEY},
    };
    return codes.value(name.toLower(), -1);
}

int KeyMap::translate(const QKeyEvent &event) const
{
    if (event.modifiers() & (Qt::ControlModifier | Qt::AltModifier | Qt::MetaModifier))
        return event.key();
    if (types(event) && focusTakesText())
        return event.key();
    const int byKey = mKeys.value(event.key(), event.key());
    return mScanCodes.isEmpty() ? byKey : mScanCodes.value(event.nativeScanCode(), byKey);
}

QKeyEvent KeyMap::translated(const QKeyEvent &event) const
{
    QKeyEvent copy(event.type(), translate(event), event.modifiers(), event.nativeScanCode(),
                   event.nativeVirtualKey(), event.nativeModifiers(), event.text(),
                   event.isAutoRepeat(), ushort(event.count()));
    copy.setTimestamp(event.timestamp());
    copy.setAccepted(event.isAccepted());
    return copy;
}

bool KeyMap::isFromPlatform(const QObject *receiver, const QEvent *event)
{
    return receiver->isWindowType() &&
           (event->type() == QEvent::KeyPress || event->type() == QEvent::KeyRelease);
}

void KeyMap::setTakesText(QWidget *widget, bool takesText)
{
    widget->setProperty(takesTextProperty, takesText);
}
