#include "network/inflater.h"

#include <zlib.h>

namespace {

constexpr int anyHeader = MAX_WBITS + 32; // gzip's or zlib's
constexpr int noHeader = -MAX_WBITS;
constexpr int blockSize = 32 * 1024;

// Feeds shrink to a tenth or a twentieth; zeros to a thousandth.
constexpr unsigned long harmlessSize = 2 * 1024 * 1024, largestRatio = 250;

} // namespace

std::unique_ptr<Inflater> Inflater::create(const QByteArray &contentEncoding)
{
    const QByteArray name = contentEncoding.trimmed().toLower();
    if (name != "gzip" && name != "x-gzip" && name != "deflate")
        return nullptr;
    return std::unique_ptr<Inflater>(new Inflater);
}

Inflater::Inflater()
    : mStream(std::make_unique<z_stream>())
{
    mIsDamaged = inflateInit2(mStream.get(), anyHeader) != Z_OK;
}

Inflater::~Inflater()
{
    inflateEnd(mStream.get());
}

void Inflater::feed(const QByteArray &bytes, QByteArray &body, qint64 most)
{
    mStream->next_in = reinterpret_cast<Bytef *>(const_cast<char *>(bytes.constData()));
    mStream->avail_in = uInt(bytes.size());
    char block[blockSize];
    bool isBlockFull = true; // more may wait inside the stream
    while (!mIsDamaged && !mIsBomb && body.size() <= most &&
           (mStream->avail_in > 0 || isBlockFull)) {
        mStream->next_out = reinterpret_cast<Bytef *>(block);
        mStream->avail_out = blockSize;
        const int result = inflate(mStream.get(), Z_NO_FLUSH);
        body.append(block, blockSize - int(mStream->avail_out));
        isBlockFull = mStream->avail_out == 0;
        mIsBomb = mStream->total_out > harmlessSize &&
                  mStream->total_out / largestRatio > mStream->total_in;
        if (result == Z_DATA_ERROR && !mIsStarted)
            retryWithoutHeader(bytes);
        else if (result == Z_STREAM_END)
            mIsDamaged = inflateReset(mStream.get()) != Z_OK; // another member may follow
        else if (result != Z_OK && result != Z_BUF_ERROR)
            mIsDamaged = true;
        mIsStarted = true;
    }
}

// Some servers call a bare stream "deflate".
void Inflater::retryWithoutHeader(const QByteArray &bytes)
{
    mStream->next_in = reinterpret_cast<Bytef *>(const_cast<char *>(bytes.constData()));
    mStream->avail_in = uInt(bytes.size());
    mIsDamaged = inflateReset2(mStream.get(), noHeader) != Z_OK;
}
