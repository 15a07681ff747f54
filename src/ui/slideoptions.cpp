#include "ui/slideoptions.h"

#include "network/systemconfig.h"

namespace {

QString valueOf(const char *key)
{
    return SystemConfig::value(QLatin1String(key)).trimmed();
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
    options.fade = number("SlideShow/Fade", 0, 5000);
    options.motion = number("SlideShow/Motion", 0, 30);
    options.blurredFill = isOn("SlideShow/BlurredFill");
    options.caption = corner("SlideShow/Caption");
    options.date = corner("SlideShow/Date");
    options.clock = corner("SlideShow/Clock");
    options.marksSeconds = number("SlideShow/MarksSeconds", 0, 3600);
    options.ahead = qMax(1, number("SlideShow/Ahead", 1, 8));
    options.sharpen = isOn("SlideShow/Sharpen");
    options.waitForPhoto = isOn("SlideShow/WaitForPhoto");
    options.loop = isOn("SlideShow/Loop");
    options.wholeList = isOn("SlideShow/WholeList");
    options.skipUnreadable = isOn("SlideShow/SkipUnreadable");
    options.returnToPhoto = isOn("SlideShow/ReturnToPhoto");
    options.keysWhileLoading = isOn("SlideShow/KeysWhileLoading");
    return options;
}
