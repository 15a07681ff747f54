#include "messagetext.h"

QString messageText(const _NETWORK_MSG_T &message)
{
    const int32_t *params = message.params;
    switch (message.type) {
    case netcommon::MSG_REQUEST_EXIT:
        return QStringLiteral("request-exit %1").arg(params[0]);
    case netcommon::MSG_EXIT_REQUEST:
        return QStringLiteral("gone");
    case netcommon::MSG_RESPONSE:
        return QStringLiteral("response %1").arg(params[0]);
    case netcommon::MSG_PLAYBACK_INFO:
        return QStringLiteral("playback %1 %2 %3 %4")
            .arg(params[0])
            .arg(params[1])
            .arg(params[2])
            .arg(params[3]);
    default:
        return QStringLiteral("unknown %1").arg(message.type);
    }
}
