#pragma once

#include <QThread>

#include <atomic>
#include <memory>

class ShellLink;
struct _NETWORK_MSG_T;

namespace netcommon {

// The platform's message thread: keeps the connection to the menu shell (also to one that comes
// later or comes back) and turns its messages into signals. All signals are emitted on this thread.
class IpcThread : public QThread
{
    Q_OBJECT

public:
    // The one thread of the process, or null when the platform has none; made at the first call.
    // The caller that ends the program waits for it and deletes it.
    static IpcThread *getInstance();
    ~IpcThread() override;

    // True from the moment the thread can be started and messages can be queued: start-up never
    // waits for a shell.
    bool isReady() const;

    // Ends run() soon; safe from any thread. wait() returns promptly afterwards.
    void stop();

public slots:
    // Answer to signalExit, sent on to the shell. Code 2: the program is leaving; the thread ends
    // after sending it.
    void responseParent(int code);
    // Play state of the slide show, sent on to the shell: (2, 0, 0, 0) playing, (2, 2, 0, 0)
    // stopped.
    void updatePlaybackinfo(int statusupdate, int status, int param3, int param4);

signals:
    void signalExit(bool isFromParent, bool isSystemError);
    void signalSetTimezone(int zone);

protected:
    void run() override;

private:
    IpcThread();
    void waitForEvent();
    void handlePackets();
    void handleMessage(const _NETWORK_MSG_T &message);

    std::shared_ptr<ShellLink> mLink;
    std::atomic<bool> mStopped{false};
};

} // namespace netcommon
