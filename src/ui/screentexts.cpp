#include "ui/screentexts.h"

#include "base/texttable.h"

namespace {

const TextTable mFailureString = {
    "Something went wrong while this page was loading.",
    "The album service has no such page, or does not let you see it.",
    "The album service takes too long to answer.",
    "The album service refused this page. Signing in again may help.",
    "The album service cannot be reached. Please check the network.",
    "Press Select to try again, or Return to go back.",
};

const TextTable mHintString = {
    "Open",
    "Try again",
};

const TextTable mQuestionString = {
    "Do you want to sign in again?",
    "The sign-in has expired, or the album service no longer accepts it.",
    "Delete comment",
    "Do you want to delete this comment?",
    "No comments yet",
    "The comment could not be deleted. Please try again later.",
    "The comment has been deleted.",
    "One moment, please...",
};

const TextTable *tableOf(int table)
{
    switch (table) {
    case ScreenTexts::FailureTable:
        return &mFailureString;
    case ScreenTexts::HintTable:
        return &mHintString;
    case ScreenTexts::QuestionTable:
        return &mQuestionString;
    default:
        return nullptr;
    }
}

} // namespace

QString ScreenTexts::text(int table, int index)
{
    return textAt(tableOf(table), index);
}
