#pragma once

#include "endtoend/albumservice.h"

#include <QSize>
#include <QTemporaryDir>

#include <functional>
#include <memory>

class HomeWidget;
class QApplication;

// What the benchmarks of the home screen stand on: an album service with pages of photos, and the
// screen itself at 1080 lines, driven by keys.
class HomeScreen
{
public:
    HomeScreen(int &argc, char **argv, int cacheMegabytes);
    ~HomeScreen();

    // Fills the service's only album and starts it.
    void serve(int pages, const QByteArray &firstPhoto = {}, const QSize &size = {640, 480});
    static QString user(); // whose album it is
    const AlbumService &service() const { return mService; }

    // Shows the first page, fetched from this origin over new connections, and waits for the next
    // one's feed.
    void open(const QString &origin);
    bool isLastPage() const;
    void press(int key);
    // Shows the list with the album, by the menu; Select then opens it.
    void openAlbums();
    // Presses the key for another page. The pictures of the page left may be forgotten first.
    void turn(bool forward);
    static void forgetPictures();
    // The page asked for is there, with all its pictures.
    bool isShown() const;
    // Handles events until the condition holds.
    static void handleEventsUntil(const std::function<bool()> &condition);
    // Handles events until it is shown, and has been painted.
    void waitUntilShown() const;
    // ... and until the feed of the page after it has come as well.
    void waitUntilIdle() const;

    int startIndex() const;    // of the page asked for
    QSize pictureSize() const; // of a cell, in device pixels

private:
    void configure(const QString &origin);
    void checkPictures() const;
    int shownUpTo() const; // the number of the page's last record

    QTemporaryDir mFolder;
    AlbumService mService;
    int mCacheMegabytes;
    std::unique_ptr<QApplication> mApplication;
    std::unique_ptr<HomeWidget> mHome;
    int mPhotos = 0;
};
