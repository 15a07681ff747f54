#pragma once

#include <QString>
#include <QVector>

using TextTable = QVector<const char *>;

// The entry at the index: "Unkown" without a table, "Unknown" for an index outside it.
QString textAt(const TextTable *table, int index);
