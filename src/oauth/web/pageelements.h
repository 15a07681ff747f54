#pragma once

#include <QList>
#include <QWebElement>

// What the remote can step through on a page: plain functions over its document, each with the log
// lines that go with it.
namespace pageelements {

using List = QList<QWebElement>;

// Append what is not in the list yet, a few hundred at most, and tell whether there was any. Fields
// are made read-only: text comes into them from the keyboard form alone.
bool collectInputs(const QWebElement &document, List *elements);
bool collectButtons(const QWebElement &document, List *elements);

// Hides what leads nowhere on a television.
void hideLinks(const QWebElement &document);

// Those of the elements that take the focus; each has had it.
List focusable(const List &elements);

void makeReadOnly(QWebElement element);
void focus(QWebElement element);
// Marks one element with a red outline, and no other.
void paintOutlines(List elements, int focused);

} // namespace pageelements
