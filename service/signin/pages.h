#pragma once

#include <string>

// The pages of the sign-in, for a television across the room and for old web engines: large, one
// column, nothing to scroll. Every text that comes in is shown as plain text.
struct SignInForm
{
    std::string formToken;
    std::string continueTo;
    std::string mail;
    std::string message;   // above the form, empty for none
    std::string challenge; // of the verification panel; empty for none
    std::string picture;   // of the panel, SVG
};
std::string signInPage(const SignInForm &form);

struct ConsentForm
{
    std::string formToken;
    std::string clientId;
    std::string redirectUri;
    std::string name; // of the person: the page's first line of text
};
std::string consentPage(const ConsentForm &form);

// The last page; its title is what the program reads.
std::string resultPage(const std::string &title, const std::string &text);
std::string errorPage(const std::string &text);
