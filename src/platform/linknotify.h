#pragma once

// Network-cable notices of the platform.

enum _NETWORK_EVENT_T {
    NETWORK_EVENT_PLUG_IN = 0,
    NETWORK_EVENT_PLUG_OUT = 1,
};

using NetworkNotifyCallback = int (*)(char *name, _NETWORK_EVENT_T event);

// Registers the one call-back that hears of every carrier change of a real network interface
// (loopback left out), once per change, with the interface's name. It is called on a thread of the
// platform. Null unregisters and ends that thread. Returns 0, or -1 when the kernel's notices
// cannot be had; then no call ever comes.
int i4_reg_network_notify_cb(NetworkNotifyCallback callback);
