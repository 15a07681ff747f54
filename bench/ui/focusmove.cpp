// A focus move in the home screen, from the key to the repainted screen, against a plain blit: a
// window that answers the key by copying the same two cells out of a picture of the whole screen.

#include "common/ui/remotekeys.h"
#include "data/photomanager.h"
#include "network/systemconfig.h"
#include "paths.h"
#include "res/resources.h"
#include "support/bench.h"
#include "support/misbehavingserver.h"
#include "ui/homewidget.h"
#include "ui/samplefeeds.h"

#include <QApplication>
#include <QBuffer>
#include <QFontDatabase>
#include <QKeyEvent>
#include <QPainter>
#include <QTemporaryFile>
#include <QtTest>

namespace {

constexpr int kRounds = 41;
constexpr int kMovesPerRound = 40;
constexpr double kFrame = 1.0 / 60;

class Blit : public QWidget
{
public:
    explicit Blit(const QPixmap &screen, const QVector<QRect> &cells)
        : mScreen(screen)
        , mCells(cells)
    {
        setAttribute(Qt::WA_OpaquePaintEvent);
    }

protected:
    void keyPressEvent(QKeyEvent *) override
    {
        for (const QRect &cell : mCells)
            update(cell);
    }
    void paintEvent(QPaintEvent *event) override
    {
        const qreal ratio = devicePixelRatioF();
        QPainter painter(this);
        for (const QRect &area : event->region())
            painter.drawPixmap(
                area.topLeft(), mScreen,
                QRectF(QPointF(area.topLeft()) * ratio, QSizeF(area.size()) * ratio).toRect());
    }

private:
    QPixmap mScreen;
    QVector<QRect> mCells;
};

void pressAndPaint(QWidget *target, int key)
{
    QKeyEvent press(QEvent::KeyPress, key, Qt::NoModifier);
    QApplication::sendEvent(target, &press);
    QCoreApplication::sendPostedEvents();
    QCoreApplication::processEvents();
}

// Right and left in turn, between the first two cells.
void moveFocus()
{
    for (int i = 0; i < kMovesPerRound; ++i)
        pressAndPaint(QApplication::focusWidget(), i % 2 ? DEVICE_LEFT_KEY : DEVICE_RIGHT_KEY);
}

QByteArray pictureFile(int hue)
{
    QImage image(640, 480, QImage::Format_RGB32);
    image.fill(QColor::fromHsv(hue, 200, 200));
    QByteArray bytes;
    QBuffer buffer(&bytes);
    buffer.open(QIODevice::WriteOnly);
    image.save(&buffer, "JPG");
    return bytes;
}

void serve(MisbehavingServer &server)
{
    QJsonArray photos;
    for (int i = 0; i < 8; ++i) {
        const QString path = QString("/picture%1.jpg").arg(i);
        server.on(path.toUtf8(), MisbehavingServer::answer(pictureFile(i * 40)));
        photos << sample::photo("Photo number " + QString::number(i), server.url(path));
    }
    server.on("/data/feed/api/featured", MisbehavingServer::answer(sample::feed(photos, 8)));
}

void configure(QTemporaryFile &file, const QString &feedBase)
{
    file.open();
    file.write("[Max]\nCacheSize=96\n[Service]\nFeedBase=" + feedBase.toUtf8() + '\n');
    file.flush();
    SystemConfig::setConfigFile(file.fileName());
}

// Share of moves that take longer than a frame.
double slowShare()
{
    int slow = 0;
    const int moves = 1000;
    for (int i = 0; i < moves; ++i) {
        const int key = i % 2 ? DEVICE_LEFT_KEY : DEVICE_RIGHT_KEY;
        slow += bench::seconds([key] { pressAndPaint(QApplication::focusWidget(), key); }) > kFrame;
    }
    return double(slow) / moves;
}

} // namespace

int main(int argc, char **argv)
{
    qInstallMessageHandler([](QtMsgType, const QMessageLogContext &, const QString &) {});
    QApplication app(argc, argv);
    initResources();
    const int id = QFontDatabase::addApplicationFont(ORVALA_FONT_FILE);
    app.setFont(QFont(QFontDatabase::applicationFontFamilies(id).value(0), 12));
    SystemConfig::mScreen_Width = 1280;
    SystemConfig::mScreen_Height = 720;
    MisbehavingServer server;
    QTemporaryFile settings;
    configure(settings, server.url(QString()));
    serve(server);
    PhotoManager::init();

    HomeWidget home;
    home.resize(1280, 720);
    home.show();
    home.activateWindow();
    QTest::qWait(1000); // for the thumbnails, which nothing reports
    auto *first = QApplication::focusWidget();
    const QRect cell(first->mapTo(&home, QPoint(0, 0)), first->size());
    Blit blit(home.grab(), {cell, cell.translated(cell.width(), 0)});
    blit.resize(home.size());
    blit.setAttribute(Qt::WA_ShowWithoutActivating);
    blit.show();
    home.activateWindow();
    if (!QTest::qWaitForWindowActive(&home) || QApplication::focusWidget() != first)
        return std::puts("the grid has no focus"), 1;
    const auto plain = [&blit] {
        for (int i = 0; i < kMovesPerRound; ++i)
            pressAndPaint(&blit, DEVICE_RIGHT_KEY);
    };
    const bench::Comparison result = bench::compare(kRounds, moveFocus, plain);
    const std::string size = std::to_string(int(720 * home.devicePixelRatioF())) + "p";
    bench::row(
        "focus move against a plain blit, " + size, result.ratio, 1.5,
        bench::milliseconds({0, result.ours / kMovesPerRound, result.reference / kMovesPerRound}));
    bench::row("share of focus moves over one frame, " + size, slowShare(), 0, "of 1000");
    return 0;
}
