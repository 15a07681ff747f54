#pragma once

#include "support/misbehavingserver.h"

// A whole sign-in, step by step, as the service plays it when all goes well. A case that goes wrong
// replaces the step in which it does.
struct SignInCase
{
    using Server = MisbehavingServer;

    static Server::Behaviour page(const QByteArray &html, int status = 200)
    {
        return Server::answer(html, status, {{"Content-Type", "text/html; charset=utf-8"}});
    }

    Server::Behaviour authorisation = Server::redirect("/ServiceLogin?to=x");
    Server::Behaviour signInPage =
        page("<title>Sign in</title><form method=post action=/ServiceLogin>"
             "<input type=email name=mail><input type=password name=pw>"
             "<button type=submit>Sign in</button></form>");
    Server::Behaviour signInPosted = Server::redirect("/o/oauth2/auth?signed=in", 303);
    Server::Behaviour consentPage =
        page("<title>Consent</title><p>\n</p><p>Anna &amp; Ole</p><h1>Allow?</h1>"
             "<form method=post action=/o/oauth2/approve>"
             "<button id=submit_approve_access name=a value=yes disabled>Allow</button>"
             "<button id=submit_deny_access name=a value=no disabled>Do not</button></form>"
             "<img src=/picture>");
    Server::Behaviour consentPosted = page("<title>Success code=4/ab</title>");
    Server::Behaviour tokens = Server::answer(
        R"({"access_token":"at","refresh_token":"rt","expires_in":3600,"token_type":"Bearer"})");

    void playOn(Server *server) const
    {
        const auto getAndPost = [](const Server::Behaviour &get, const Server::Behaviour &post) {
            return [get, post](QTcpSocket *socket, const Server::Request &request) {
                (request.method == "POST" ? post : get)(socket, request);
            };
        };
        server->on("/o/oauth2/auth", [first = authorisation, second = consentPage](
                                         QTcpSocket *socket, const Server::Request &request) {
            (request.path.contains("signed=in") ? second : first)(socket, request);
        });
        server->on("/ServiceLogin", getAndPost(signInPage, signInPosted));
        server->on("/o/oauth2/approve", consentPosted);
        server->on("/o/oauth2/token", tokens);
    }
};

using SignInStep = MisbehavingServer::Behaviour SignInCase::*;
Q_DECLARE_METATYPE(SignInStep)
