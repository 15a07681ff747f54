#include "ui/slideoptions.h"

#include "network/systemconfig.h"

namespace {

QString valueOf(const char *key)
{
    return SystemConfig::value(QStringLiteral("SlideShow/") + QLatin1String(key)).trimmed();
}

bool isOn(const char *key)
{
    return valueOf(key).compare(QLatin1String("true"), Qt::CaseInsensitive) == 0;
}

int number(const char *key, int fallback, int most)
{
    bool isNumber = false;
    const int value = valueOf(key).toInt(&isNumber);
    return isNumber ? qBound(0, value, most) : fallback;
}

SlideCorner corner(const char *key)
{
    const QString name = valueOf(key).toLower();
    if (name == QLatin1String("topleft"))
        return SlideCorner::TopLeft;
    if (name == QLatin1String("topright"))
        return SlideCorner::TopRight;
    if (name == QLatin1String("bottomleft"))
        return SlideCorner::BottomLeft;
    if (name == QLatin1String("bottomright"))
        return SlideCorner::BottomRight;
    return SlideCorner::None;
}

} // namespace

SlideOptions SlideOptions::configured()
{
    SlideOptions options;
    options.fade = number("Fade", 0, 5000);
    options.motion = number("Motion", 0, 30);
    options.blurredFill = isOn("BlurredFill");
    options.caption = corner("Caption");
    options.date = corner("Date");
    options.clock = corner("Clock");
    options.marksSeconds = number("MarksSeconds", 0, 3600);
    options.ahead = qMax(1, number("Ahead", 1, 8));
    options.sharpen = isOn("Sharpen");
    options.waitForPhoto = isOn("WaitForPhoto");
    options.loop = isOn("Loop");
    options.wholeList = isOn("WholeList");
    options.skipUnreadable = isOn("SkipUnreadable");
    options.returnToPhoto = isOn("ReturnToPhoto");
    options.keysWhileLoading = isOn("KeysWhileLoading");
    return options;
}
