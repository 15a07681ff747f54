#pragma once

#include <QString>

// Texts that a pop-up must survive.

inline QString longText(const QString &part)
{
    QString text;
    while (text.size() < 10000)
        text += part;
    return text;
}

inline QString hebrew()
{
    return QStringLiteral(u"האלבום של המשפחה, קיץ 2024 ");
}

inline QString emoji()
{
    return QStringLiteral(u"👨‍👩‍👧‍👦🏖️ summer 日本 ");
}
