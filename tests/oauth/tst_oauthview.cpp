#include "common/ui/remotekeys.h"
#include "oauth/web/oauthview.h"
#include "oauth/web/pagewatchdog.h"
#include "oauth/web/scripttext.h"
#include "support/logcapture.h"
#include "support/misbehavingserver.h"

#include <QNetworkAccessManager>
#include <QNetworkReply>
#include <QWebFrame>
#include <QtTest>

#include <atomic>

namespace {

const QString kLogin = QStringLiteral("http://127.0.0.1/ServiceLogin");
const QString kConsent = QStringLiteral("http://127.0.0.1/o/oauth2/auth?client_id=x");
const QString kForm = QStringLiteral(
    "<body><form onsubmit='document.title=\"sent\";return false'>"
    "<div id=inputs><input id=a type=text><input id=secret type=hidden></div>"
    "<input id=mail type=email><input id=pw type=password>"
    "<select id=lang-chooser><option>x</select><label class=remember><button type=button id=c>"
    "</button></label><a id=link-signup href=#>y</a><a id=link-forgot-passwd href=#>z</a>"
    "<button type=submit id=go>Go</button></form>");

} // namespace

class TestOAuthView : public QObject
{
    Q_OBJECT

    std::unique_ptr<OAuthView> mView;
    std::unique_ptr<LogCapture> mLog;

    void open(const QString &html, const QString &address = kLogin)
    {
        QSignalSpy finished(mView.get(), &QWebView::loadFinished);
        mView->setHtml(html, QUrl(address));
        QTRY_VERIFY(!finished.isEmpty());
    }
    QVariant run(const QString &script)
    {
        return mView->page()->mainFrame()->evaluateJavaScript(script);
    }
    void press(int key, const QString &text = QString())
    {
        QKeyEvent event(QEvent::KeyPress, key, Qt::NoModifier, text);
        QApplication::sendEvent(mView.get(), &event);
    }
    QString focused() { return run("document.activeElement.id").toString(); }
    // The elements with a red outline.
    QString outlined()
    {
        QStringList ids;
        for (const QWebElement &element : mView->document().findAll("*")) {
            if (element.attribute("style").contains("outline-color: red"))
                ids << element.attribute("id");
        }
        return ids.join(' ');
    }
    QStringList walk(int key, int steps)
    {
        QStringList ids{focused()};
        for (int i = 0; i < steps; ++i) {
            press(key);
            ids << focused();
        }
        return ids;
    }

private slots:
    void init()
    {
        OAuthView::LoginUrl = kLogin;
        OAuthView::AuthorizeUrl = "http://127.0.0.1/o/oauth2/auth?";
        mLog = std::make_unique<LogCapture>();
        mView = std::make_unique<OAuthView>();
        mView->resize(800, 600);
        mView->show();
    }
    void cleanup()
    {
        mView.reset();
        mLog.reset();
    }

    void steps()
    {
        QSignalSpy shown(mView.get(), &OAuthView::pageLoadFinished);
        open(kForm);
        QCOMPARE(shown.size(), 1);
        QCOMPARE(walk(DEVICE_RIGHT_KEY, 4), QStringList({"a", "mail", "pw", "go", "a"}));
        QCOMPARE(walk(DEVICE_UP_KEY, 4), QStringList({"a", "go", "pw", "mail", "a"}));
        QCOMPARE(walk(DEVICE_DOWN_KEY, 1).last(), QString("mail"));
        QCOMPARE(walk(DEVICE_LEFT_KEY, 1).last(), QString("a"));
        QCOMPARE(outlined(), QString("a"));
        for (const char *id : {"lang-chooser", "link-signup", "link-forgot-passwd", "c"})
            QCOMPARE(run(QString("document.getElementById('%1').offsetWidth").arg(id)).toInt(), 0);
        // The remote's digits do not reach a field past the keyboard form.
        press(Qt::Key_1, "1");
        QCOMPARE(run("document.getElementById('a').value").toString(), QString());
        press(DEVICE_RIGHT_KEY);
        press(DEVICE_SELECT_KEY);
        QCOMPARE(mView->editedType(), QString("email"));
        mView->setEditedText("a'b\\c");
        QCOMPARE(mView->editedText(), QString("a'b\\c"));
        open(kForm);
        QCOMPARE(shown.size(), 1); // only the first time
        // One button alone is no consent page; and afterwards the sign-in page is new again.
        open("<body><button id=submit_approve_access>", kConsent);
        QCOMPARE(outlined(), QString());
        open(kForm);
        QCOMPARE(shown.size(), 2);
    }

    // Whatever is typed arrives as it is, and nothing of it runs.
    void scriptTexts()
    {
        QString every;
        for (ushort code = 0; code < 0x300; ++code)
            every += QChar(code);
        for (const QString &text :
             {every, QString("');hit=1;('"), QString("\\');hit=1;//"), QString("%1%2</script>"),
              QString("\\u0027"), QString("a\u2028b\u2029c\r\nd"), QString("\U0001F600\ufeff"),
              QString(QChar(0xd800))}) {
            QCOMPARE(run("'" + scriptText(text) + "'").toString(), text);
            QCOMPARE(run('"' + scriptText(text) + '"').toString(), text);
            QVERIFY(!run("typeof hit == 'number'").toBool());
        }
    }

    void nothingToFocus()
    {
        for (const QString &address : {kLogin, kConsent, QString("http://127.0.0.1/other")}) {
            open("", address);
            for (int key : {DEVICE_DOWN_KEY, DEVICE_LEFT_KEY, DEVICE_SELECT_KEY})
                press(key);
            mView->setEditedText("x");
            QCOMPARE(mView->editedType(), QString());
        }
    }

    // After a reload a panel comes, and goes again.
    void panel()
    {
        const QString panel = "document.body.innerHTML = '<div id=logincaptcha><input type=text "
                              "id=digits></div><input type=password id=pw>%1'";
        open(kForm);
        open(kForm);
        mView->handleValidatePanel(); // no panel: nothing changes
        QCOMPARE(focused(), QString("a"));
        run(panel.arg("<button type=submit id=go>"));
        mView->handleValidatePanel();
        QCOMPARE(walk(DEVICE_RIGHT_KEY, 3), QStringList({"digits", "pw", "go", "digits"}));
        run("document.body.innerHTML = '<input type=password id=pw>'");
        mView->handleValidatePanel();
        QCOMPARE(focused(), QString("pw"));
        QSignalSpy error(mView.get(), &OAuthView::errorOccured);
        run(panel.arg("") + ";document.body.style.display='none'");
        mView->handleValidatePanel();
        QCOMPARE(error.size(), 1);
    }

    // The element that is being edited may be gone when its text comes.
    void pageChangesMeanwhile()
    {
        open(kForm);
        press(DEVICE_SELECT_KEY);
        run("document.open();document.write('<p>gone');document.close()");
        mView->setEditedText("x");
        press(DEVICE_RIGHT_KEY);
        press(DEVICE_SELECT_KEY);
        open("<p>Next", "http://127.0.0.1/other");
        mView->setEditedText("x");
        QCOMPARE(run("document.body.textContent").toString(), QString("Next"));
    }

    // A page that would keep the browser busy fails, or is shown soon.
    void busyPages_data()
    {
        QTest::addColumn<MisbehavingServer::Behaviour>("answer");
        QTest::addColumn<bool>("loads");
        const auto row = [](const char *name, const MisbehavingServer::Behaviour &answer,
                            bool loads = false) { QTest::newRow(name) << answer << loads; };
        const auto page = [](const QByteArray &html) {
            return MisbehavingServer::answer(html, 200, {{"Content-Type", "text/html"}});
        };
        row("compressed zeros", MisbehavingServer::gzipBomb(2));
        row("zeros", MisbehavingServer::answer(QByteArray(400000, '\0')));
        row("endless", page(QByteArray(3000000, 'a')));
        row("deeply nested", page(QByteArray("<div>").repeated(40000)));
        row("slowly nested", MisbehavingServer::drip(QByteArray("<b>").repeated(6000), 900, 1));
        row("thousands of fields", page(QByteArray("<input type=text>").repeated(4900)), true);
        row("ordinary", page(kForm.toUtf8() + QByteArray("<p>word").repeated(4000)), true);
    }

    void busyPages()
    {
        QFETCH(MisbehavingServer::Behaviour, answer);
        QFETCH(bool, loads);
        MisbehavingServer server;
        server.otherwise(answer);
        OAuthView::LoginUrl = server.url("/ServiceLogin");
        QSignalSpy finished(mView.get(), &QWebView::loadFinished);
        QElapsedTimer time;
        time.start();
        mView->load(QUrl(server.url("/ServiceLogin")));
        QTRY_VERIFY_WITH_TIMEOUT(!finished.isEmpty(), 20000);
        QCOMPARE(finished.value(0).value(0).toBool(), loads);
        QVERIFY2(time.elapsed() < 5000, qPrintable(QString::number(time.elapsed())));
        // Nothing of it stays to be counted with the next page.
        server.otherwise(MisbehavingServer::html());
        mView->load(QUrl(server.url("/next")));
        QTRY_COMPARE(finished.size(), 2);
        QVERIFY(finished.value(1).value(0).toBool());
    }

    // A busy loop stands for a page's script: both keep the event loop from turning.
    void scriptWithoutEnd()
    {
        std::atomic<int> hung{0};
        const PageWatchdog watchdog(std::chrono::milliseconds(500), nullptr, [&hung] { ++hung; });
        QTest::qWait(1000);
        QCOMPARE(hung.load(), 0);
        QElapsedTimer time;
        time.start();
        while (hung == 0 && time.elapsed() < 20000) {
        }
        QCOMPARE(hung.load(), 1);
    }

    void pageThatFillsTheMemory()
    {
        std::atomic<int> hung{0};
        const PageWatchdog watchdog(std::chrono::seconds(10), nullptr, [&hung] { ++hung; });
        const QByteArray page(PageWatchdog::MOST_GROWTH + 64 * 1024 * 1024, 'x');
        QTRY_COMPARE_WITH_TIMEOUT(hung.load(), 1, 20000);
    }

    void nothingLocal()
    {
        QTemporaryFile file;
        QVERIFY(file.open());
        file.write("<title>local</title>");
        file.close();
        const QString local = QUrl::fromLocalFile(file.fileName()).toString();
        MisbehavingServer server;
        server.on("/", MisbehavingServer::answer("<iframe src='" + local.toUtf8() + "'></iframe>",
                                                 200, {{"Content-Type", "text/html"}}));
        server.on("/file", MisbehavingServer::redirect(local.toUtf8()));
        for (const QString &address : {server.url("/file"), server.url("/")}) {
            QSignalSpy finished(mView.get(), &QWebView::loadFinished);
            mView->load(QUrl(address));
            QTRY_VERIFY(!finished.isEmpty());
            QVERIFY(mView->title() != "local");
            for (const QWebFrame *frame : mView->page()->mainFrame()->childFrames())
                QVERIFY(frame->title() != "local");
        }
        QNetworkReply *reply =
            mView->page()->networkAccessManager()->get(QNetworkRequest(QUrl(local)));
        QTRY_VERIFY(reply->isFinished());
        QVERIFY(reply->error() != QNetworkReply::NoError);
    }
};

QTEST_MAIN(TestOAuthView)
#include "tst_oauthview.moc"
