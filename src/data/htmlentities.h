#pragma once

#include <QString>

// The text with the service's entities replaced by plain characters, for titles, summaries and
// comments before they are shown. "&amp;" goes first, so that text escaped twice is undone twice.
QString unescapeHtml(QString text);
