#include "network/inflater.h"
#include "fuzz.h"

// The first byte says in which pieces the rest arrives.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *data, std::size_t size)
{
    constexpr qint64 most = 1 << 20;
    constexpr qint64 slack = 1 << 17; // of the last piece
    if (size == 0)
        return 0;
    const auto inflater = Inflater::create(data[0] & 1 ? "gzip" : "deflate");
    const int piece = 1 + data[0] / 2;
    QByteArray body;
    for (int at = 1; at < int(size); at += piece) {
        const int length = qMin(piece, int(size) - at);
        inflater->feed(QByteArray(reinterpret_cast<const char *>(data) + at, length), body, most);
    }
    if (body.size() > most + slack)
        broken();
    return 0;
}
