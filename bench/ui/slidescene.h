#pragma once

#include "support/misbehavingserver.h"
#include "ui/qimageslide.h"
#include "ui/slidephotos.h"
#include "ui/widget.h"

#include <QApplication>
#include <QTemporaryFile>
#include <QtTest>

#include <memory>

// What the benchmarks of the slide show stand on: the player at 1280 x 720, times QT_SCALE_FACTOR,
// its home screen, and a server of its own in the same process that has one list of photos.
class SlideScene
{
public:
    // Lines of the configuration's group "SlideShow".
    SlideScene(int &argc, char **argv, const QByteArray &slideShow);
    ~SlideScene();

    // Of the screen, in device pixels.
    static QSize screen();
    // A list of that many records, whose photos have these bytes in turn, or those of these files.
    void serve(int records, const QList<QByteArray> &jpegs);
    void serveFiles(int records, const QStringList &files);
    // Shows the list, and the player at that photo, stopped or playing.
    void open(int index, bool isPlaying = false);

    QImageSlide *player() const { return mPage->player(); }
    bool showsPhoto() const { return player()->label()->placeholder().isEmpty(); }
    bool isPrepared(int position) const;
    void forgetRequests() { mServer.forgetRequests(); }

    template <typename Condition>
    static void waitFor(Condition condition)
    {
        if (!QTest::qWaitFor(condition, 30000))
            qFatal("the photo does not come");
    }
    // What paints answers the key before this returns.
    static void pressAndPaint(QWidget *target, int key);

private:
    void serveList(int records);

    QApplication mApplication;
    MisbehavingServer mServer;
    QTemporaryFile mSettings;
    std::unique_ptr<Widget> mPage;
};
