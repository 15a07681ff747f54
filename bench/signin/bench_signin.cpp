// The sign-in on the service's own pages, with the whole program and the real album service.
//
//   bench_signin          how long the two waits in it are, against a headless Chromium
//   bench_signin COUNT    that many sign-ins in a row, each looked up in the account file

#include "accountmanager/accountmanagerhelper.h"
#include "app/mainapplication.h"
#include "common/ui/remotekeys.h"
#include "endtoend/albumservice.h"
#include "endtoend/signinvisit.h"
#include "endtoend/television.h"
#include "res/resources.h"
#include "signin/chromium.h"
#include "support/bench.h"
#include "ui/homewidget.h"
#include "ui/upwidget.h"

#include <QWebView>

#include <memory>

namespace {

constexpr int ROUNDS = 15;
constexpr int PHOTOS = 16;

const QString people[] = {"anna@orvala.example", "ben@orvala.example"};
const QString password = "mountains";

void must(bool done, const char *what)
{
    if (!done)
        qFatal("%s", what);
}

template <typename Condition>
double secondsUntil(Condition condition, const bench::Work &start)
{
    return bench::seconds([&] {
        start();
        while (!condition())
            QCoreApplication::processEvents();
    });
}

// Sees when the home screen has been painted.
class PaintWatch : public QObject
{
public:
    PaintWatch() { qApp->installEventFilter(this); }

    bool painted = false;

    bool eventFilter(QObject *watched, QEvent *event) override
    {
        painted = painted || (event->type() == QEvent::Paint &&
                              qobject_cast<HomeWidget *>(watched) != nullptr);
        return false;
    }
};

struct Waits
{
    double toPage; // from New to a page that takes keys
    double toHome; // from Allow to the home screen
};

// The television of a household, at the account list.
class Household
{
public:
    Household()
    {
        for (int i = 0; i < PHOTOS; ++i)
            must(service.addPhoto(QStringLiteral("%1/Sea/%2.jpg").arg(i % 2).arg(i), Qt::blue),
                 "no photo");
        for (int i = 0; i < 2; ++i)
            must(service.addUser(people[i], people[i], QString::number(i), password), "no user");
        must(service.start() && service.waitForPhotos(PHOTOS), "no service");
        tv = std::make_unique<Television>();
        tv->useService(service.url());
        must(tv->switchOn(), "no television");
    }

    Waits signIn(const QString &mail)
    {
        tv->press({DEVICE_RIGHT_KEY, DEVICE_RIGHT_KEY});
        const SignInVisit visit(tv.get());
        Waits waits{};
        waits.toPage = secondsUntil([&] { return tv->page() && tv->focus() == "OAuthView"; },
                                    [&] { tv->press(DEVICE_SELECT_KEY); });
        must(visit.fill(mail, password) && visit.submit() && visit.isAtConsent(), "no consent");
        const PaintWatch watch;
        waits.toHome =
            secondsUntil([&] { return watch.painted; }, [&] { tv->press(DEVICE_SELECT_KEY); });
        return waits;
    }

    void signOut() const
    {
        while (tv->isLoading())
            QCoreApplication::processEvents();
        must(tv->enter(UpWidget::SignOutEntry), "no menu");
        tv->press(DEVICE_SELECT_KEY);
        while (tv->home())
            QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    }

    AlbumService service;
    std::unique_ptr<Television> tv;
};

QString pageOf(const AlbumService &service)
{
    return service.url() + "/o/oauth2/auth?client_id=583920174652-abcdefghijklmnopqrstuvwxyz"
                           "&redirect_uri=urn:ietf:wg:oauth:2.0:oob&scope=x&response_type=code";
}

Waits visitWith(Chromium &browser, const AlbumService &service)
{
    Waits waits{};
    waits.toPage = bench::seconds([&] { browser.open(pageOf(service)); });
    browser.leave("document.querySelector('[type=email]').value='" + people[0] +
                  "';document.querySelector('[type=password]').value='" + password +
                  "';document.querySelector('[type=submit]').click()");
    waits.toHome = bench::seconds([&] {
        browser.leave("const b=document.querySelector('#submit_approve_access');"
                      "b.removeAttribute('disabled');b.click()");
    });
    return waits;
}

std::string inMilliseconds(double seconds)
{
    char text[32];
    std::snprintf(text, sizeof text, "%.1f ms", seconds * 1e3);
    return text;
}

void print(const std::string &what, const std::vector<double> &ours,
           const std::vector<double> &theirs)
{
    if (theirs.empty()) {
        std::printf("%s: %s; no chromium here to compare with\n", what.c_str(),
                    inMilliseconds(bench::median(ours)).c_str());
        return;
    }
    std::vector<double> ratios;
    for (std::size_t i = 0; i < ours.size(); ++i)
        ratios.push_back(ours[i] / theirs[i]);
    bench::row(what, bench::median(ratios), 0,
               inMilliseconds(bench::median(ours)) + " against " +
                   inMilliseconds(bench::median(theirs)));
}

void measure(Household &household)
{
    Chromium browser;
    const bool compares = Chromium::isInstalled();
    std::vector<double> firstPage, firstPageThere, page, pageThere, home, homeThere;
    for (int round = 0; round <= ROUNDS; ++round) {
        const Waits ours = household.signIn(people[0]);
        household.signOut();
        (round ? page : firstPage).push_back(ours.toPage);
        if (round)
            home.push_back(ours.toHome);
        if (!compares)
            continue;
        const double start = round ? 0 : bench::seconds([&] { browser.start(); });
        const Waits theirs = visitWith(browser, household.service);
        (round ? pageThere : firstPageThere).push_back(start + theirs.toPage);
        if (round)
            homeThere.push_back(theirs.toHome);
    }
    print("from New to the sign-in page, the first time, against starting Chromium with it",
          firstPage, firstPageThere);
    print("from New to the sign-in page, later, against a new tab of Chromium", page, pageThere);
    print("from Allow to the home screen's first paint, against Chromium's next page", home,
          homeThere);
}

// Whether the account is stored as the one signed in, with the tokens in use.
bool isStored(const QString &mail)
{
    const QString access = AccountManagerHelper::getAccessToken();
    const QString refresh = AccountManagerHelper::getRefreshToken();
    const AccountManagerHelper::Session session;
    return !access.isEmpty() && AccountManagerHelper::getLatestLoginAccount() == mail &&
           AccountManagerHelper::login(mail, "7305") &&
           AccountManagerHelper::getAccessToken() == access &&
           AccountManagerHelper::getRefreshToken() == refresh;
}

int signInOften(Household &household, int count)
{
    int lost = 0;
    const double seconds = bench::seconds([&] {
        for (int i = 0; i < count; ++i) {
            household.signIn(people[i % 2]);
            lost += !isStored(people[i % 2]);
            household.signOut();
        }
    });
    std::printf("%d sign-ins in a row, %.0f ms each: %d lost\n", count, seconds / count * 1e3,
                lost);
    return lost ? 1 : 0;
}

} // namespace

int main(int argc, char *argv[])
{
    MainApplication application(argc, argv);
    initResources();
    Household household;
    const int count = argc > 1 ? QByteArray(argv[1]).toInt() : 0;
    if (count > 0)
        return signInOften(household, count);
    measure(household);
    return 0;
}
