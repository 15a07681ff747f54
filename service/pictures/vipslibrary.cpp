#include "pictures/vipslibrary.h"

namespace {

void setUp()
{
    if (VIPS_INIT("orvala-service") != 0)
        return; // every later call fails with an error of its own
    vips_block_untrusted_set(TRUE);
    // The server's threads each make a picture of their own, and a picture is made once.
    vips_concurrency_set(1);
    vips_cache_set_max(0);
    // A damaged photo is answered with an error; the library's own lines would only flood the log.
    g_log_set_handler(
        "VIPS", static_cast<GLogLevelFlags>(G_LOG_LEVEL_WARNING | G_LOG_LEVEL_INFO),
        [](const gchar *, GLogLevelFlags, const gchar *, gpointer) {}, nullptr);
}

} // namespace

void startVips()
{
    static const bool started = (setUp(), true);
    (void)started;
}

std::string takeVipsError()
{
    char *buffer = vips_error_buffer_copy();
    std::string text = buffer ? buffer : "";
    g_free(buffer);
    text.erase(std::min(text.find('\n'), text.size()));
    return text.empty() ? "the picture cannot be decoded" : text;
}
