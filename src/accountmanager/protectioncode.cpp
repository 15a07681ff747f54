#include "accountmanager/protectioncode.h"

#include "network/systemconfig.h"

#include <QVariant>

bool protectioncode::isOffered()
{
    return QVariant(SystemConfig::value(QStringLiteral("Accounts/ProtectionCodes"))).toBool();
}
