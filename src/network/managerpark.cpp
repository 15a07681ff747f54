#include "network/managerpark.h"

#include "network/systemconfig.h"

#include <QCoreApplication>
#include <QNetworkAccessManager>
#include <QNetworkCookieJar>
#include <QTimer>

#include <algorithm>
#include <memory>
#include <vector>

namespace {

// The image downloads that run at once and one feed.
constexpr std::size_t mostParked = 6;

struct Parked
{
    std::unique_ptr<QNetworkAccessManager> manager;
    std::unique_ptr<QTimer> expiry;
};

std::vector<Parked> &parked()
{
    static std::vector<Parked> entries;
    return entries;
}

// Deferred: one of its replies may be in the middle of a signal.
void drop(std::vector<Parked>::iterator entry)
{
    entry->manager.release()->deleteLater();
    entry->expiry.release()->deleteLater();
    parked().erase(entry);
}

void dropExpired(const QTimer *expiry)
{
    auto &entries = parked();
    const auto entry = std::find_if(entries.begin(), entries.end(), [expiry](const Parked &one) {
        return one.expiry.get() == expiry;
    });
    if (entry != entries.end())
        drop(entry);
}

// Sockets and their threads must be gone before the application object is.
void clearAtExit()
{
    static const QCoreApplication *registered = nullptr;
    if (registered == QCoreApplication::instance())
        return;
    registered = QCoreApplication::instance();
    qAddPostRoutine([] {
        registered = nullptr;
        ManagerPark::clear();
    });
}

} // namespace

namespace ManagerPark {

QNetworkAccessManager *take()
{
    auto &entries = parked();
    if (entries.empty())
        return new QNetworkAccessManager;
    QNetworkAccessManager *manager = entries.back().manager.release();
    entries.pop_back();
    manager->setCookieJar(new QNetworkCookieJar);
    return manager;
}

void park(QNetworkAccessManager *manager)
{
    const int seconds = SystemConfig::idleConnectionSeconds();
    if (seconds == 0 || !QCoreApplication::instance() || QCoreApplication::closingDown()) {
        manager->deleteLater();
        return;
    }
    clearAtExit();
    manager->setParent(nullptr);
    auto &entries = parked();
    if (entries.size() == mostParked)
        drop(entries.begin());
    auto expiry = std::make_unique<QTimer>();
    expiry->setSingleShot(true);
    QObject::connect(expiry.get(), &QTimer::timeout, expiry.get(),
                     [timer = expiry.get()] { dropExpired(timer); });
    expiry->start(seconds * 1000);
    entries.push_back({std::unique_ptr<QNetworkAccessManager>(manager), std::move(expiry)});
}

void clear()
{
    parked().clear();
}

} // namespace ManagerPark
