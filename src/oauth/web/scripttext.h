#pragma once

#include <QString>

// The text as the inside of a script's string literal, in either kind of quotes: whatever it holds,
// the literal's value is the text, and nothing of it runs.
QString scriptText(const QString &text);
