#include "base/i18n.h"

#include "base/texttable.h"

namespace {

// Longer than a line, and so apart: inside a table it would look as if a comma were missing.
const char authorizeAgain[] = "You have do some incorrect operations, please press \"Return\" to "
                              "authorize your account again!";
const char aboutAccounts[] = "Account Manager can simplify your login process to Orvala. Please "
                             "enter your local login ID and protection code.";

const TextTable mTitleString = {
    "Home",       "My Photos",   "Search",        "Tags List",    "Add New Tag",
    "Delete tag", "Add Comment", "Comments List", "Logout",       "Input text",
    "Favorites",  "Error",       "Notification",  "Unknown User",
};

const TextTable mLabelString = {
    "    Message content",
    "Sign out",
    "Photo Name",
    "Tag:",
    "Tags List",
    "Comments:",
    "+New Comment",
    "More Comments",
    "  Are you sure to delete tag:\n",
    "Search Photos",
    "  Are you sure to logout your account:\n",
    "Featured Photos",
    "My Photos",
    "+New Tag",
    "Search",
    "No Tags",
    "Post Result",
    "My Favorite",
    " photo",
    "Slideshow Setting",
    "Slideshow Mode:",
    "Slideshow Speed:",
    "normal",
    "random",
    "shuffle",
    " seconds",
    " photos",
    "Are you sure you want to delete this account?",
    "Delete Account",
    "Please register on PC and try again later.\n",
};

const TextTable mShortCutString = {
    "Page Up", "Page Down", "Return",     "Expand",    "Input Options", "ABC",     "OK",
    "Goto",    "Next",      "Slide Show", "Main Menu", "Pause",         "Setting", "Prev",
};

const TextTable mButtonString = {
    "Yes", "No", "Send", "Next", "Cancel", "Close", "OK", "Return", "New", "Exit", "Delete",
};

const TextTable mPromptString = {
    "Error: Authorization Failed",
    "Authorization Failed by some reason, it will exit App.",
    "Login, please wait...",
    "Local Account",
    "Sorry, you cannot enter empty content!",
    "Message is sending, please wait...",
    "Post unsuccessfully, please try again later!",
    "Post successfully!",
    "Sorry, failed to delete this tag! Please try again later!",
    "Congratulation! This tag has been deleted successfully!",
    authorizeAgain,
    "The server is not responding, please try again later.",
    "Sorry, the server does not permit this operation!",
    "The network cable was plugged out, please check it!",
    "The network cable was plugged in, please wait before network connection restores!",
    "No Photo Available!",
};

const TextTable mLoginString = {
    "Orvala Login",
    "Account manager",
    aboutAccounts,
    "Login ID",
    "Up to 8 characters",
    "Protection code",
    "4 numbers",
    "Please input number with remote controller",
    "The user password is incorrect, please try it again!",
    "Please input the password again to confirm!",
    "The new input isn't the older one, please try it again!",
    "This account is exist, please input correct password to authorize it.",
};

const TextTable *tableOf(int table)
{
    switch (table) {
    case I18n::TitleTable:
        return &mTitleString;
    case I18n::LabelTable:
        return &mLabelString;
    case I18n::ShortCutTable:
        return &mShortCutString;
    case I18n::ButtonTable:
        return &mButtonString;
    case I18n::PromptTable:
        return &mPromptString;
    case I18n::LoginTable:
        return &mLoginString;
    default:
        return nullptr;
    }
}

} // namespace

QString textAt(const TextTable *table, int index)
{
    if (!table)
        return QStringLiteral("Unkown");
    if (index < 0 || index >= table->size())
        return QStringLiteral("Unknown");
    return QString::fromLatin1(table->at(index));
}

QString I18n::text(int table, int index)
{
    return textAt(tableOf(table), index);
}
