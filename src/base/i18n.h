#pragma once

#include <QString>

// Every text that a user sees, by table and index. The wording of the entries is fixed: screens
// hold table numbers and indexes, never literals of their own.
class I18n
{
public:
    enum Table {
        TitleTable = 0,
        LabelTable = 2,
        ShortCutTable = 3,
        ButtonTable = 4,
        PromptTable = 5,
        LoginTable = 6
    };

    // The text, or "Unknown" for an index outside the table, "Unkown" for a table that does not
    // exist.
    static QString text(int table, int index);

    static QString title(int index) { return text(TitleTable, index); }
    static QString label(int index) { return text(LabelTable, index); }
    static QString shortCut(int index) { return text(ShortCutTable, index); }
    static QString button(int index) { return text(ButtonTable, index); }
    static QString prompt(int index) { return text(PromptTable, index); }
    static QString login(int index) { return text(LoginTable, index); }
};
