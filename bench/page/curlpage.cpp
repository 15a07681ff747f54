#include "page/curlpage.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace {

constexpr int PER_PAGE = 8;
constexpr long AT_ONCE = 5;
constexpr int WIDTH = 1920, HEIGHT = 1080, PIXEL = 4;

[[noreturn]] void fail(const char *what)
{
    std::fprintf(stderr, "bench_page: %s\n", what);
    std::exit(1);
}

size_t append(char *data, size_t size, size_t count, void *body)
{
    static_cast<std::string *>(body)->append(data, size * count);
    return size * count;
}

} // namespace

CurlPage::CurlPage(const QString &origin)
    : mOrigin(origin.toStdString())
    , mMulti(curl_multi_init())
    , mDecoder(tjInitDecompress())
    , mBackground(size_t(WIDTH) * HEIGHT * PIXEL, 0x30)
    , mFrame(mBackground.size())
{
    curl_multi_setopt(mMulti, CURLMOPT_MAX_TOTAL_CONNECTIONS, AT_ONCE);
    for (int i = 0; i < PER_PAGE; ++i) {
        CURL *handle = curl_easy_init();
        curl_easy_setopt(handle, CURLOPT_SSL_VERIFYPEER, 0L);
        curl_easy_setopt(handle, CURLOPT_SSL_VERIFYHOST, 0L);
        curl_easy_setopt(handle, CURLOPT_FAILONERROR, 1L);
        curl_easy_setopt(handle, CURLOPT_WRITEFUNCTION, append);
        mHandles.push_back(handle);
    }
}

CurlPage::~CurlPage()
{
    for (CURL *handle : mHandles)
        curl_easy_cleanup(handle);
    curl_multi_cleanup(mMulti);
    tjDestroy(mDecoder);
}

std::vector<std::string> CurlPage::fetch(const std::vector<std::string> &urls)
{
    std::vector<std::string> bodies(urls.size());
    for (size_t i = 0; i < urls.size(); ++i) {
        curl_easy_setopt(mHandles[i], CURLOPT_URL, urls[i].c_str());
        curl_easy_setopt(mHandles[i], CURLOPT_WRITEDATA, &bodies[i]);
        curl_multi_add_handle(mMulti, mHandles[i]);
    }
    int running = 1;
    while (running) {
        curl_multi_perform(mMulti, &running);
        if (running)
            curl_multi_poll(mMulti, nullptr, 0, 100, nullptr);
    }
    for (size_t i = 0; i < urls.size(); ++i)
        curl_multi_remove_handle(mMulti, mHandles[i]);
    for (const std::string &body : bodies) {
        if (body.empty())
            fail("a download failed");
    }
    return bodies;
}

std::vector<std::string> CurlPage::thumbnails(const std::string &feed)
{
    std::vector<std::string> urls;
    const simdjson::padded_string text(feed);
    auto document = mParser.iterate(text);
    for (auto entry : document["feed"]["entry"]) {
        std::string_view last;
        for (auto thumbnail : entry["media$group"]["media$thumbnail"])
            last = thumbnail["url"].get_string();
        urls.emplace_back(last);
    }
    if (urls.size() != PER_PAGE)
        fail("the feed has no page of photos");
    return urls;
}

void CurlPage::paint(const std::string &jpeg, int index, const QSize &cell)
{
    const auto *data = reinterpret_cast<const unsigned char *>(jpeg.data());
    int width = 0, height = 0, subsampling = 0, colours = 0;
    tjDecompressHeader3(mDecoder, data, jpeg.size(), &width, &height, &subsampling, &colours);
    if (width > cell.width() || height > cell.height())
        fail("a picture does not fit its cell");
    std::vector<unsigned char> pixels(size_t(width) * height * PIXEL);
    if (tjDecompress2(mDecoder, data, jpeg.size(), pixels.data(), width, 0, height, TJPF_BGRX, 0))
        fail("a picture cannot be decoded");
    const size_t row = size_t(width) * PIXEL;
    const int left = index % 4 * cell.width(), top = index / 4 * cell.height();
    for (int y = 0; y < height; ++y)
        std::memcpy(&mFrame[(size_t(top + y) * WIDTH + left) * PIXEL], &pixels[y * row], row);
}

void CurlPage::show(int startIndex, const QSize &cell)
{
    const std::string feed =
        mOrigin + "/data/feed/api/featured?alt=json&max-results=8&start-index=";
    const std::vector<std::string> urls =
        thumbnails(fetch({feed + std::to_string(startIndex)}).front());
    const std::vector<std::string> pictures = fetch(urls);
    mFrame = mBackground;
    for (int i = 0; i < PER_PAGE; ++i)
        paint(pictures[i], i, cell);
}
