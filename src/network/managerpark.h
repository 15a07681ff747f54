#pragma once

class QNetworkAccessManager;

// Keeps the access managers of finished request objects, with their open sockets, for the next
// ones: opening a page on new connections takes several times as long. A handful is kept, each for
// SystemConfig::idleConnectionSeconds().
namespace ManagerPark {

// The manager parked last, or a new one. It has no parent and an empty cookie jar.
QNetworkAccessManager *take();
// Takes a manager over that no request object uses any more.
void park(QNetworkAccessManager *manager);
// Closes every idle socket, for example when the network link has gone down.
void clear();

} // namespace ManagerPark
