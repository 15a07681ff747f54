#pragma once

#include <QSize>
#include <QString>

#include <curl/curl.h>
#include <simdjson.h>
#include <turbojpeg.h>

#include <string>
#include <vector>

// A page of photos by the bare libraries: the feed through libcurl and simdjson, eight pictures
// over at most five connections that stay open, each decoded by turbojpeg into a picture of its own
// and copied into a frame of 1080 lines.
class CurlPage
{
public:
    explicit CurlPage(const QString &origin);
    ~CurlPage();
    CurlPage(const CurlPage &) = delete;
    CurlPage &operator=(const CurlPage &) = delete;

    // Ends the program if anything fails, or if a picture is larger than a cell.
    void show(int startIndex, const QSize &cell);

private:
    std::vector<std::string> fetch(const std::vector<std::string> &urls);
    std::vector<std::string> thumbnails(const std::string &feed);
    void paint(const std::string &jpeg, int index, const QSize &cell);

    std::string mOrigin;
    CURLM *mMulti;
    std::vector<CURL *> mHandles;
    tjhandle mDecoder;
    simdjson::ondemand::parser mParser;
    std::vector<unsigned char> mBackground;
    std::vector<unsigned char> mFrame;
};
