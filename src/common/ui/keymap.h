#pragma once

#include <QHash>
#include <QKeyEvent>
#include <QString>

class QWidget;

// Which keys of a keyboard, gamepad or television dongle stand for which keys of the remote: the
// group "Keys" of the configuration, read once. Each entry is a physical key and the remote's key,
// as in "Backspace=Return". Without the group nothing is mapped.
//
// A physical key is one of Qt's key names (Qt::Key without its "Key_", or as written in shortcuts),
// or "scan:" and the number that the platform reports, for keys that Qt has no code for. Names that
// mean nothing are logged once and left out.
//
// A key is mapped where the platform delivers it, at the window, and nowhere else: the remote's
// Return is what a keyboard calls Return, so a second pass would map it again.
class KeyMap
{
public:
    using Entries = QHash<QString, QString>; // physical key to remote key

    explicit KeyMap(const Entries &entries);
    static KeyMap fromConfiguration();
    // The configuration's map, read at the first call.
    static const KeyMap &instance();

    bool isEmpty() const { return mKeys.isEmpty() && mScanCodes.isEmpty(); }

    // The remote's key for this press or release; the event's own key when it is not mapped, when
    // Ctrl, Alt or Meta are held, or when the focus widget takes text and the key types some.
    int translate(const QKeyEvent &event) const;

    // The same event with its key translated. Its text stays, so a field can still take it.
    QKeyEvent translated(const QKeyEvent &event) const;

    // Whether this is a key on its way from the platform to a window: the one place to translate.
    static bool isFromPlatform(const QObject *receiver, const QEvent *event);

    // Marks a widget that takes typed text while it has the focus: keys that print and Backspace
    // and Delete then reach it unmapped; Enter, Escape and the arrows are mapped as ever.
    static void setTakesText(QWidget *widget, bool takesText = true);

    // The code of a remote key by its name ("Select", "PlayPause", ...), -1 for an unknown one.
    static int remoteKey(const QString &name);

private:
    void add(const QString &physical, const QString &remote);

    QHash<int, int> mKeys;
    QHash<quint32, int> mScanCodes;
};
