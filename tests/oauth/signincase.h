#pragma once

#include "support/misbehavingserver.h"

#include <memory>

// A whole sign-in, step by step, as the service plays it when all goes well. A case that goes wrong
// overrides the step in which it does.
class SignInCase
{
public:
    using Server = MisbehavingServer;

    virtual ~SignInCase() = default;

    static Server::Behaviour page(const QByteArray &html, int status = 200)
    {
        return Server::answer(html, status, {{"Content-Type", "text/html; charset=utf-8"}});
    }

    virtual Server::Behaviour authorisation() { return Server::redirect("/ServiceLogin?to=x"); }
    virtual Server::Behaviour signInPage()
    {
        return page("<title>Sign in</title><form method=post action=/ServiceLogin>"
                    "<input type=email name=mail><input type=password name=pw>"
                    "<button type=submit>Sign in</button></form>");
    }
    virtual Server::Behaviour signInPosted()
    {
        return Server::redirect("/o/oauth2/auth?signed=in", 303);
    }
    virtual Server::Behaviour consentPage()
    {
        return page("<title>Consent</title><p>\n</p><p>Anna &amp; Ole</p><h1>Allow?</h1>"
                    "<form method=post action=/o/oauth2/approve>"
                    "<button id=submit_approve_access name=a value=yes disabled>Allow</button>"
                    "<button id=submit_deny_access name=a value=no disabled>Do not</button></form>"
                    "<img src=/picture>");
    }
    virtual Server::Behaviour consentPosted() { return page("<title>Success code=4/ab</title>"); }
    virtual Server::Behaviour tokens()
    {
        return Server::answer(
            R"({"access_token":"at","refresh_token":"rt","expires_in":3600,"token_type":"Bearer"})");
    }

    void playOn(Server *server)
    {
        const auto getAndPost = [](const Server::Behaviour &get, const Server::Behaviour &post) {
            return [get, post](QTcpSocket *socket, const Server::Request &request) {
                (request.method == "POST" ? post : get)(socket, request);
            };
        };
        const Server::Behaviour first = authorisation(), second = consentPage();
        server->on("/o/oauth2/auth",
                   [first, second](QTcpSocket *socket, const Server::Request &request) {
                       (request.path.contains("signed=in") ? second : first)(socket, request);
                   });
        server->on("/ServiceLogin", getAndPost(signInPage(), signInPosted()));
        server->on("/o/oauth2/approve", consentPosted());
        server->on("/o/oauth2/token", tokens());
    }
};

Q_DECLARE_METATYPE(std::shared_ptr<SignInCase>)
