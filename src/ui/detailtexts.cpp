#include "ui/detailtexts.h"

#include "base/texttable.h"

namespace {

const TextTable mDetailString = {
    "Zoom",
    "Info",
    "Full Screen",
    "Closer",
    "Farther",
    "Options",
    "Untitled",
    "by",
    "%1 x %2 pixels",
    "Comments are on their way...",
    "No comments yet",
    "The comments could not be loaded.",
    "The album service has no such photo any more.",
    "This photo cannot be shown.",
    "The next photos could not be loaded. Please try again.",
    "More photos are on their way...",
};

} // namespace

QString DetailTexts::text(int index)
{
    return textAt(&mDetailString, index);
}
