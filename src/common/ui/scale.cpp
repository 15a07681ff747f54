#include "common/ui/scale.h"

#include "network/systemconfig.h"

#include <QGuiApplication>
#include <QScreen>

#include <private/qhighdpiscaling_p.h>

namespace {

constexpr QSize layoutSize(1280, 720);

bool isConfigured()
{
    return !SystemConfig::value(QStringLiteral("Layout/Scale")).isEmpty();
}

} // namespace

qreal scaleFor(qreal setting, const QSize &screen)
{
    qreal factor = setting;
    if (qFuzzyIsNull(setting)) {
        factor = qMin(qreal(screen.width()) / layoutSize.width(),
                      qreal(screen.height()) / layoutSize.height());
    }
    return factor > 0 ? qBound(0.25, factor, 8.0) : 1;
}

void prepareScale()
{
    if (!isConfigured())
        return;
    QCoreApplication::setAttribute(Qt::AA_Use96Dpi);
    QCoreApplication::setAttribute(Qt::AA_UseHighDpiPixmaps);
}

void applyScale()
{
    const QScreen *screen = QGuiApplication::primaryScreen();
    if (!isConfigured() || !screen)
        return;
    const qreal factor = scaleFor(SystemConfig::scaleSetting(), screen->size());
    // Qt's public way to scale, an environment variable, is read before the screen is known.
    QHighDpiScaling::setGlobalFactor(factor);
    SystemConfig::setScale(factor);
}
