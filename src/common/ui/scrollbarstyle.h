#pragma once

#include <QString>

// The scroll bar of every list, for the end of its style sheet.
inline QString scrollBarStyle()
{
    return QStringLiteral(
        "QScrollBar:vertical {width: 10px; background: #1c2730; border-radius: 5px;}"
        "QScrollBar::handle:vertical {min-height: 40px; background: #c9d5dd; border-radius: 5px;}"
        "QScrollBar::add-line, QScrollBar::sub-line {height: 0px;}");
}
