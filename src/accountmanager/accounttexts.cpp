#include "accountmanager/accounttexts.h"

#include "base/texttable.h"

namespace {

// Longer than a line, and so apart: inside the table it would look as if a comma were missing.
const char notStored[] = "The sign-in went well, but this device could not store the account. "
                         "Press \"Return\" to go back, and try again later.";

const TextTable mAccountString = {
    "No account is stored on this device yet. Choose New to add one.",
    "This account is not stored any more. Please choose another one.",
    "This account could not be signed in. Please try again, or choose another one.",
    "The stored accounts cannot be read at the moment. Please try again later.",
    "Signing in to a new account is not possible: a part of the program is missing or damaged.",
    notStored,
    "This account could not be deleted. Please try again later.",
    "No account on this device has a protection code of its own yet.",
};

} // namespace

QString AccountTexts::text(int index)
{
    return textAt(&mAccountString, index);
}
