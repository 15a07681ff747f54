#include "signin/pages.h"

#include <map>

namespace {

using Values = std::map<std::string, std::string>;

const char frame[] = R"html(<!DOCTYPE html>
<html lang="en"><head><meta charset="utf-8"><title>{title}</title>
<style>
html { font-size: 28px; font-size: 3.9vh; }
body { margin: 0; padding: 15vh 8% 0; background: #0e161d; color: #f2f6f9;
  font-family: Inter, "DejaVu Sans", sans-serif; font-size: 1rem; line-height: 1.35;
  overflow: hidden; text-align: center; }
h1 { margin: 0 0 .7em; font-size: 1.5em; font-weight: bold; }
p { margin: 0 0 .9em; }
form { width: 25em; margin: 0 auto; }
.row { display: table; width: 100%; margin-bottom: .7em; }
.row span, .row div { display: table-cell; vertical-align: middle; text-align: left; }
.row span { width: 7em; }
input { width: 100%; height: 2.2em; box-sizing: border-box; padding: 0 .6em; font: inherit;
  color: #f2f6f9; background: #0a0f14; border: 2px solid #75848f; border-radius: 6px; }
button { min-width: 9em; height: 2.2em; margin: .4em .3em 0; padding: 0 1.2em; font: inherit;
  color: #f2f6f9; background: #2c3843; border: 2px solid #64737f; border-radius: 6px; }
.row button { margin-left: 0; }
input:focus, button:focus { border-color: #f2f6f9; box-shadow: 0 0 0 .14em #f2f6f9;
  outline-offset: -2px; }
input:focus { background: #0f3d61; }
button:focus { background: #1969a5; }
::selection { background: transparent; }
button:disabled { color: #75848f; }
.message { display: inline-block; padding: .3em 1em; color: #14181f; background: #ffd27a;
  border-radius: 6px; }
.name { margin: 1.5em 0 .2em; max-height: 2.7em; overflow: hidden; word-wrap: break-word;
  font-size: 1.3em; color: #a2bbc9; font-weight: bold; }
svg { display: block; width: 9.4em; height: 2.9em; }
</style></head>
<body>{{body}}</body></html>
)html";

const char signIn[] = R"html(<h1>Sign in to your photos</h1>
{{message}}
<form method="post" action="/ServiceLogin" autocomplete="off" novalidate>
<input type="hidden" name="form" value="{form}">
<input type="hidden" name="continue" value="{continue}">
{{panel}}
<label class="row"><span>E-mail</span><div><input type="email" name="mail" value="{mail}"></div></label>
<label class="row"><span>Password</span><div><input type="password" name="password"></div></label>
<div class="row"><span></span><div><button type="submit">Sign in</button></div></div>
</form>)html";

const char message[] = R"html(<p class="message">{message}</p>)html";

const char panel[] = R"html(<div id="logincaptcha">
<input type="hidden" name="challenge" value="{challenge}">
<label class="row"><span>Digits in the picture</span><div style="width:10em">{{picture}}</div>
<div><input type="text" name="digits"></div></label></div>)html";

// The buttons wait for a moment, so that a key pressed twice on the page before allows nothing.
const char consent[] = R"html(<p class="name">{name}</p>
<h1>Show your photos on this screen?</h1>
<p>It will see your albums and what others here share with you, and may write comments and tags and
add photos in your name.</p>
<form method="post" action="/o/oauth2/approve" style="width:auto">
<input type="hidden" name="form" value="{form}">
<input type="hidden" name="client_id" value="{client}">
<input type="hidden" name="redirect_uri" value="{redirect}">
<button id="submit_approve_access" type="submit" name="answer" value="allow" disabled>Allow</button>
<button id="submit_deny_access" type="submit" name="answer" value="deny" disabled>Do not allow</button>
</form>
<script>
setTimeout(function () {
  document.getElementById("submit_approve_access").removeAttribute("disabled");
  document.getElementById("submit_deny_access").removeAttribute("disabled");
}, 800);
</script>)html";

const char plain[] = R"html(<h1 style="margin-top:4em">{text}</h1>)html";

std::string escaped(const std::string &text)
{
    std::string result;
    for (const char c : text) {
        switch (c) {
        case '&':
            result += "&amp;";
            break;
        case '<':
            result += "&lt;";
            break;
        case '>':
            result += "&gt;";
            break;
        case '"':
            result += "&quot;";
            break;
        default:
            result += c;
        }
    }
    return result;
}

// Puts values in the places of their names: escaped for "{name}", as it is for "{{name}}", which
// takes parts of pages. What has been put in is not looked at again.
std::string filled(const std::string &text, const Values &values)
{
    std::string result;
    std::size_t start = 0;
    for (;;) {
        const std::size_t open = text.find('{', start);
        if (open == std::string::npos)
            return result + text.substr(start);
        result += text.substr(start, open - start);
        const bool isPart = text.compare(open, 2, "{{") == 0;
        const std::size_t name = open + (isPart ? 2 : 1), close = text.find('}', name);
        const auto value = values.find(text.substr(name, close - name));
        if (value == values.end()) {
            result += '{'; // of a style or a script
            start = open + 1;
            continue;
        }
        result += isPart ? value->second : escaped(value->second);
        start = close + (isPart ? 2 : 1);
    }
}

std::string framed(const std::string &title, const std::string &body)
{
    return filled(frame, {{"title", title}, {"body", body}});
}

} // namespace

std::string signInPage(const SignInForm &form)
{
    const std::string said =
        form.message.empty() ? "" : filled(message, {{"message", form.message}});
    const std::string verification =
        form.challenge.empty()
            ? ""
            : filled(panel, {{"challenge", form.challenge}, {"picture", form.picture}});
    return framed("Sign in", filled(signIn, {{"form", form.formToken},
                                             {"continue", form.continueTo},
                                             {"mail", form.mail},
                                             {"message", said},
                                             {"panel", verification}}));
}

std::string consentPage(const ConsentForm &form)
{
    return framed("Allow access", filled(consent, {{"name", form.name},
                                                   {"form", form.formToken},
                                                   {"client", form.clientId},
                                                   {"redirect", form.redirectUri}}));
}

std::string resultPage(const std::string &title, const std::string &text)
{
    return framed(title, filled(plain, {{"text", text}}));
}

std::string errorPage(const std::string &text)
{
    return framed("Sign-in is not possible", filled(plain, {{"text", text}}));
}
