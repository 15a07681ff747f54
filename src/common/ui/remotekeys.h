#pragma once

#include <qnamespace.h>

// Codes of the remote control, as they arrive in key-press events.
enum RemoteKey : int {
    DEVICE_UP_KEY = Qt::Key_Up,
    DEVICE_DOWN_KEY = Qt::Key_Down,
    DEVICE_LEFT_KEY = Qt::Key_Left,
    DEVICE_RIGHT_KEY = Qt::Key_Right,
    DEVICE_SELECT_KEY = Qt::Key_Select,
    DEVICE_RETURN_KEY = Qt::Key_Return,
    DEVICE_PLAY_KEY = Qt::Key_MediaPlay,
    DEVICE_PLAYPAUSE_KEY = 0x01000052,
    DEVICE_PAUSE_KEY = Qt::Key_Pause,
    DEVICE_PRE_KEY = Qt::Key_MediaPrevious,
    DEVICE_NEXT_KEY = Qt::Key_MediaNext,
    DEVICE_PAGEUP_KEY = 0x010000C0,
    DEVICE_PAGEDOWN_KEY = 0x01020006,
    DEVICE_RED_KEY = 0x010000CB,
    DEVICE_SETTING_KEY = 0x010000DF,
    DEVICE_CLEAR_KEY = Qt::Key_Clear,
    DEVICE_EXIT_KEY = 0x01020001,
    MEDIA_CENTER_KEY = 0x0100010A, // named in the key log, without an action
};
