#include "oauth/web/scripttext.h"

namespace {

// Whether the character ends a literal or a line of it, or begins an escape.
bool isSpecial(QChar character)
{
    const ushort code = character.unicode();
    return code < 0x20 || code == '\'' || code == '"' || code == '\\' || code == '<' ||
           (code >= 0x7f && code < 0xa0) || code == 0x2028 || code == 0x2029 ||
           character.isSurrogate();
}

} // namespace

QString scriptText(const QString &text)
{
    QString result;
    result.reserve(text.size());
    for (const QChar character : text) {
        if (isSpecial(character))
            result += QStringLiteral("\\u") +
                      QString::number(character.unicode(), 16).rightJustified(4, QLatin1Char('0'));
        else
            result += character;
    }
    return result;
}
