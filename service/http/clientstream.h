#pragma once

#include <httplib.h>
#include <openssl/ssl.h>

#include <chrono>
#include <memory>
#include <string>

// One client's connection, with or without TLS, as the HTTP library reads and writes it: buffered,
// so that a small answer leaves in one piece, and bounded, so that no client keeps a thread or
// fills the memory by sending slowly or without end.
class ClientStream : public httplib::Stream
{
public:
    struct Limits
    {
        std::chrono::seconds head{10}; // from its first byte to the end of the header lines
        std::chrono::seconds body{30}; // for the rest, and again for the answer, beside what ...
        std::size_t bytesPerSecond = 4096; // ... that many bytes take
        std::chrono::seconds silence{20};  // without a byte in either direction
        std::size_t headBytes = 0;         // header lines
    };

    // Takes the socket over. `stopEvent` is a descriptor that becomes readable when every wait has
    // to end. No `context`: no TLS.
    ClientStream(int socket, SSL_CTX *context, int stopEvent, const Limits &limits);
    ~ClientStream() override;

    // The TLS handshake is done, or there is none.
    bool isSecured() const { return mHandshakeDone; }
    // Completes the TLS handshake, once; false when the client does not manage it.
    bool handshake();
    void beginRequest();
    const std::string &address() const { return mAddress; }
    // The rest of the request has at most so many bytes.
    void headArrived(std::size_t bodyBytes);
    // Bytes of a next request are here already, or come within a moment.
    bool hasInput() const;
    bool awaitsInput(std::chrono::milliseconds moment);
    bool flush();
    // Something broke that leaves the rest of the input meaningless.
    bool isBroken() const { return mBroken; }
    // For a request whose body nobody will read.
    void closeAfterAnswer();

    bool is_readable() const override;
    bool is_writable() const override;
    ssize_t read(char *bytes, size_t size) override;
    ssize_t write(const char *bytes, size_t size) override;
    void get_remote_ip_and_port(std::string &ip, int &port) const override;
    void get_local_ip_and_port(std::string &ip, int &port) const override;
    socket_t socket() const override { return mSocket; }

private:
    using Clock = std::chrono::steady_clock;

    bool wait(short events);
    bool waitForTls(int result);
    ssize_t receive(char *bytes, std::size_t size);
    ssize_t send(const char *bytes, std::size_t size);
    bool sendAll();
    bool fill();
    void notePace(ssize_t bytes);
    bool fail();
    void drain();

    const int mSocket;
    const int mStopEvent;
    const Limits mLimits;
    std::string mAddress;
    SSL *mSsl = nullptr;
    bool mHandshakeDone = false;
    bool mBroken = false;
    bool mHasUnread = false;
    Clock::time_point mDeadline;
    bool mIsPaced = false; // the deadline moves with what goes through
    bool mIsAnswering = false;
    std::size_t mBytesLeft = 0;
    std::string mInput;
    std::size_t mInputStart = 0;
    std::string mOutput;
};
