#pragma once

class QNetworkReply;
class QNetworkRequest;

// Session tickets of TLS 1.3 by host, so that a new socket to a known host needs no full handshake.
// (Tickets of TLS 1.2 make a handshake slower with this toolkit: they are left alone.)
namespace TlsSessions {

// Puts the host's ticket, if there is one, into the request.
void offer(QNetworkRequest &request);
// Keeps the ticket of a finished reply: it arrives after the handshake.
void remember(const QNetworkReply &reply);

} // namespace TlsSessions
