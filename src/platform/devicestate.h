#pragma once

// Device state that the platform reports while the program runs. Written by MainWidget on the GUI
// thread, read by the screens and records there.

extern bool NetworkCableStatus; // true: the cable is plugged in (or has not been reported yet)
extern bool IsSetTimeZone;      // true once the platform has sent a time zone
extern int TimeZone;            // offset from UTC in whole hours, valid while IsSetTimeZone is true
