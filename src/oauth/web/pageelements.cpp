#include "oauth/web/pageelements.h"

#include "base/log.h"

#include <QWebElementCollection>

namespace {

struct Selector
{
    const char *selector;
    const char *name; // as the log calls it
};

const Selector kInputs[] = {{"div[id=inputs]>input", "div[id=inputs]>input"},
                            {"input[type=text]", "type=text"},
                            {"input[type=email]", "type=email"},
                            {"input[type=password]", "type=password"}};

const Selector kButtons[] = {{"*[type=submit]", "button[type=submit]"},
                             {"*[type=button]", "button[type=button]"}};

const char *const kUseless[] = {"*[id=link-signup]", "*[id=link-forgot-passwd]",
                                "*[class=remember]", "select[id=lang-chooser]"};

// More than anybody steps through; the browser needs a millisecond for each, and again at every
// key.
constexpr int kMostElements = 300;

const QString kOutlined =
    QStringLiteral("outline-style: solid;outline-width: 2px;outline-color: red;");

void logMissing(const char *name)
{
    logLine("Donot Find the ", name);
}

template <std::size_t count>
bool collect(const QWebElement &document, const Selector (&selectors)[count],
             pageelements::List *elements)
{
    bool found = false;
    for (const Selector &selector : selectors) {
        const QWebElementCollection matches =
            document.findAll(QString::fromLatin1(selector.selector));
        if (matches.count() == 0)
            logMissing(selector.name);
        for (const QWebElement &element : matches) {
            found = true;
            if (elements->size() >= kMostElements)
                break;
            // One that two selectors match would be two steps for the arrow keys.
            if (!elements->contains(element))
                elements->append(element);
        }
    }
    return found;
}

} // namespace

bool pageelements::collectInputs(const QWebElement &document, List *elements)
{
    List inputs;
    const bool found = collect(document, kInputs, &inputs);
    for (const QWebElement &input : qAsConst(inputs))
        makeReadOnly(input);
    *elements += inputs;
    return found;
}

bool pageelements::collectButtons(const QWebElement &document, List *elements)
{
    return collect(document, kButtons, elements);
}

void pageelements::hideLinks(const QWebElement &document)
{
    for (const char *selector : kUseless) {
        const QWebElementCollection matches = document.findAll(QString::fromLatin1(selector));
        if (matches.count() == 0)
            logMissing(selector);
        for (QWebElement element : matches)
            element.setAttribute(QStringLiteral("style"), QStringLiteral("display:none"));
    }
}

pageelements::List pageelements::focusable(const List &elements)
{
    List kept;
    for (const QWebElement &element : elements) {
        focus(element);
        if (element.hasFocus()) {
            logLine("filterElement this.focus() return true");
            kept.append(element);
        } else {
            logLine("filterElement this.focus() return false=");
        }
    }
    return kept;
}

void pageelements::makeReadOnly(QWebElement element)
{
    element.evaluateJavaScript(QStringLiteral("this.readOnly = true"));
}

void pageelements::focus(QWebElement element)
{
    element.evaluateJavaScript(QStringLiteral("this.focus()"));
}

void pageelements::paintOutlines(List elements, int focused)
{
    for (int i = 0; i < elements.size(); ++i)
        elements[i].setAttribute(QStringLiteral("style"),
                                 i == focused ? kOutlined : QStringLiteral("none"));
}
