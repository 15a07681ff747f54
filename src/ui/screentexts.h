#pragma once

#include <QString>

// The screens' own texts, by table and index: what they say beyond the wording of I18n.
class ScreenTexts
{
public:
    enum Table { FailureTable = 0, HintTable = 1, QuestionTable = 2 };

    // Index in the table of failures.
    enum Failure {
        PageFailed = 0,
        PageNotFound = 1,
        PageTooSlow = 2,
        PageRefused = 3,
        NoConnection = 4,
        HowToGoOn = 5
    };

    // Index in the table of key hints.
    enum Hint { OpenHint = 0, RetryHint = 1 };

    // Index in the table of what is asked and told in pop-ups.
    enum Question {
        SignInAgain = 0,
        SignInExpired = 1,
        DeleteCommentTitle = 2,
        DeleteComment = 3,
        NoComments = 4,
        CommentNotDeleted = 5,
        CommentDeleted = 6,
        Loading = 7
    };

    // The text, or "Unknown" for an index outside the table, "Unkown" for a table that does not
    // exist.
    static QString text(int table, int index);

    static QString failure(int index) { return text(FailureTable, index); }
    static QString hint(int index) { return text(HintTable, index); }
    static QString question(int index) { return text(QuestionTable, index); }
};
