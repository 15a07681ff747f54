#pragma once

#include <QString>
#include <QThread>

#include <atomic>

// Stands between the program and its album service, in a thread of its own, and answers a third of
// the requests in a way that no service should, or not at all.
class SpoiltService : public QThread
{
public:
    SpoiltService(quint16 service, quint32 seed);
    ~SpoiltService() override;

    QString url() const { return mUrl; }
    // Closes what is open, so that nobody waits for an answer any longer.
    void closeConnections();
    int spoilt() const { return mSpoilt; }

protected:
    void run() override;

private:
    const quint16 mService;
    const quint32 mSeed;
    QString mUrl;
    std::atomic<bool> mIsReady{false};
    std::atomic<int> mSpoilt{0};
    QObject *mServer = nullptr; // lives in the thread
};
