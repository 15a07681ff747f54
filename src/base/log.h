#pragma once

#include <QDebug>

// Writes one plain debug line: the parts are joined as they stand, without blanks or quotes between
// them. Fixed log texts go through here, so that a test can listen with Qt's message handler.
template <typename... Parts>
void logLine(const Parts &...parts)
{
    QDebug line = QMessageLogger().debug().noquote().nospace();
    (void)(line << ... << parts);
}
