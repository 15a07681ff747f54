#pragma once

#include <QByteArray>

#include <memory>

struct z_stream_s;

// Takes the compression off an answer's body as it arrives. The toolkit would do so by itself, but
// without a bound: a megabyte can stand for a gigabyte.
class Inflater
{
public:
    // Null for a content encoding that is no compression.
    static std::unique_ptr<Inflater> create(const QByteArray &contentEncoding);
    ~Inflater();

    // Appends what the bytes stand for to the body, until that has more than `most` bytes. Bytes
    // after the first damaged one are dropped: whoever reads the body finds it cut.
    void feed(const QByteArray &bytes, QByteArray &body, qint64 most);
    // The bytes stand for so much more than themselves that this is no honest answer; the rest of
    // it is not looked at, which would keep the screen waiting.
    bool isBomb() const { return mIsBomb; }

private:
    Inflater();

    void retryWithoutHeader(const QByteArray &bytes);

    std::unique_ptr<z_stream_s> mStream;
    bool mIsStarted = false;
    bool mIsDamaged = false;
    bool mIsBomb = false;
};
