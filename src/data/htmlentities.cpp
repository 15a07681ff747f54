#include "data/htmlentities.h"

QString unescapeHtml(QString text)
{
    static const struct
    {
        QLatin1String entity;
        QLatin1String plain;
    } replacements[] = {
        {QLatin1String("&amp;"), QLatin1String("&")},
        {QLatin1String("&quot;"), QLatin1String("\"")},
        {QLatin1String("&lt;"), QLatin1String("<")},
        {QLatin1String("&gt;"), QLatin1String(">")},
        {QLatin1String("<br />"), QLatin1String("\n")},
    };
    for (const auto &replacement : replacements)
        text.replace(replacement.entity, replacement.plain);
    return text;
}
