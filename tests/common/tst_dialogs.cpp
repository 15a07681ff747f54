#include "accountmanager/accountmanagerhelper.h"
#include "common/keyrobot.h"
#include "common/longtexts.h"
#include "common/ui/frames.h"
#include "common/ui/qconfirm.h"
#include "common/ui/qpopupdialog.h"
#include "common/ui/qpopupform.h"
#include "common/ui/qpopuplist.h"
#include "common/ui/qtoastwidget.h"
#include "network/systemconfig.h"
#include "res/resources.h"
#include "support/logcapture.h"

#include <QLabel>
#include <QPushButton>
#include <QSignalSpy>
#include <QTest>

class tst_Dialogs : public QObject
{
    Q_OBJECT

    // A screen that pop-ups lie over.
    struct Screen : QWidget
    {
        Screen()
        {
            setFixedSize(1280, 720);
            setFocusPolicy(Qt::StrongFocus);
            show();
            setFocus();
        }
    };

    static QStringList texts(const QWidget &dialog)
    {
        QStringList texts;
        for (const QLabel *label : dialog.findChildren<QLabel *>())
            texts << label->text();
        for (const QPushButton *button : dialog.findChildren<QPushButton *>())
            texts << button->text();
        return texts;
    }

    // Whether every visible part lies inside the screen and no text needs more than its place.
    static bool isInside(QWidget *dialog)
    {
        for (QWidget *part : dialog->findChildren<QWidget *>()) {
            const QRect place(part->mapTo(dialog, QPoint()), part->size());
            if (part->isVisible() && !dialog->rect().contains(place))
                return false;
            const auto *label = qobject_cast<QLabel *>(part);
            if (label && label->textFormat() != Qt::PlainText)
                return false;
            if (label && (label->sizeHint().width() > label->width() ||
                          label->sizeHint().height() > label->height()))
                return false;
        }
        return true;
    }

private slots:
    void initTestCase()
    {
        initResources();
        SystemConfig::mScreen_Width = 1280;
        SystemConfig::mScreen_Height = 720;
        AccountManagerHelper::setUserName(QStringLiteral("Anna"));
    }

    void questions_data()
    {
        QTest::addColumn<int>("type");
        QTest::addColumn<QString>("title");
        QTest::addColumn<QString>("message");
        QTest::newRow("tag") << 0 << "Delete tag"
                             << "  Are you sure to delete tag:\n sun & sea";
        QTest::newRow("sign out") << 1 << "Logout"
                                  << "  Are you sure to logout your account:\n  Anna?";
        QTest::newRow("account") << 2 << "Delete Account"
                                 << "Are you sure you want to delete this account?";
        QTest::newRow("user") << 3 << "Unknown User"
                              << "Please register on PC and try again later.\n"
                                 "Are you sure to exit qtorvala?";
    }

    void questions()
    {
        QFETCH(int, type);
        QFETCH(QString, title);
        QFETCH(QString, message);
        LogCapture log;
        QConfirm question;
        QSignalSpy yes(&question, &QConfirm::clickConfirm);
        QSignalSpy no(&question, &QConfirm::clickCancel);
        question.init(type, QStringLiteral("sun &amp; sea"));
        QCOMPARE(texts(question), QStringList({title, message, "Yes", "No"}));
        QVERIFY(log.contains(QStringLiteral("{QConfirm::init} mType = %1").arg(type)));
        for (int key : {DEVICE_LEFT_KEY, DEVICE_SELECT_KEY, DEVICE_RIGHT_KEY, DEVICE_RIGHT_KEY})
            pressKey(&question, key);
        QCOMPARE(question.findChildren<QPushButton *>().at(1)->styleSheet(),
                 QStringLiteral("border-style:outset; border-image:url(:/res/Button_Focus.png); "
                                "border-width: 6px;"));
        for (int key : {DEVICE_SELECT_KEY, DEVICE_RETURN_KEY, DEVICE_UP_KEY})
            pressKey(&question, key);
        QCOMPARE(yes.size(), 1);
        QCOMPARE(no.size(), 1);
        QVERIFY(log.contains(QStringLiteral("{QConfirm::keyPressEvent} key value = 16777234")));
    }

    void noSuchQuestion()
    {
        QConfirm question;
        QSignalSpy yes(&question, &QConfirm::clickConfirm);
        question.init(4, QStringLiteral("x"));
        QKeyEvent select(QEvent::KeyPress, DEVICE_SELECT_KEY, Qt::NoModifier);
        QApplication::sendEvent(&question, &select);
        QVERIFY(!select.isAccepted());
        QVERIFY(yes.isEmpty());
    }

    void longTagIsCut()
    {
        QConfirm question;
        question.init(QConfirm::DeleteTag, longText(QStringLiteral("seaside ")));
        const QLabel *message = question.findChildren<QLabel *>().at(1);
        QVERIFY(message->text().endsWith(QChar(0x2026)));
        const QString line = message->text().replace(QLatin1Char('\n'), QString());
        const int width = message->fontMetrics().horizontalAdvance(line);
        QVERIFY2(width <= 998 && width > 900, qPrintable(QString::number(width)));
    }

    void messageButtons()
    {
        LogCapture log;
        QPopupDialog dialog;
        QSignalSpy accepted(&dialog, &QPopupDialog::accepted);
        QSignalSpy rejected(&dialog, &QPopupDialog::rejected);
        dialog.initDialog("Title", "Message", {});
        dialog.initDialog("Title", "Message", {"1", "2", "3"});
        QCOMPARE(LogCapture::lines().count(QStringLiteral(
                     "QPopupDialog::initDialog ERROR, empty or out of max(2) buttons !!")),
                 2);
        pressKey(&dialog, DEVICE_SELECT_KEY);
        QVERIFY(dialog.findChildren<QLabel *>().isEmpty() && accepted.isEmpty());
        dialog.initDialog("Title", "Message", {"Yes", "No"});
        const auto buttons = dialog.findChildren<QPushButton *>();
        QCOMPARE(buttons.first()->size(), QSize(120, 40));
        QCOMPARE(buttons.first()->styleSheet(),
                 QStringLiteral("border-image: url(:/res/Button_Focus.png); outline-width: 0px; "
                                "border-width: 6px;"));
        for (int key : {DEVICE_LEFT_KEY, DEVICE_SELECT_KEY, DEVICE_RIGHT_KEY, DEVICE_RIGHT_KEY,
                        DEVICE_SELECT_KEY, DEVICE_RETURN_KEY})
            pressKey(&dialog, key);
        buttons.first()->click();
        QCOMPARE(accepted.size(), 2);
        QCOMPARE(rejected.size(), 2);
        QVERIFY(log.contains(QStringLiteral("QPopupDialog::keyPressEvent!!!")));
    }

    void oneButton()
    {
        QPopupDialog dialog;
        QSignalSpy accepted(&dialog, &QPopupDialog::accepted);
        dialog.initDialog("Title", "Message", {"Close"});
        for (int key : {DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY, DEVICE_RETURN_KEY})
            pressKey(&dialog, key);
        QCOMPARE(accepted.size(), 2);
    }

    void textsStayInside_data()
    {
        QTest::addColumn<QString>("text");
        QTest::newRow("words") << longText(QStringLiteral("many words "));
        QTest::newRow("one word") << QString(10000, QLatin1Char('W'));
        QTest::newRow("right to left") << longText(hebrew());
        QTest::newRow("emoji") << longText(emoji());
        QTest::newRow("line ends") << longText(QStringLiteral("a\r\n\u2029\n"));
        QTest::newRow("markup") << longText(QStringLiteral("<table><tr><td><img src=x>"));
        QTest::newRow("without width") << longText(QString(QChar(0x200b)));
        QTest::newRow("half a pair") << longText(QString(QChar(0xd83d)));
    }

    void textsStayInside()
    {
        QFETCH(QString, text);
        AccountManagerHelper::setUserName(text);
        Screen screen;
        QPopupDialog dialog(&screen);
        dialog.initDialog(text, text, {text, text});
        dialog.show();
        QCOMPARE(dialog.size(), screen.size());
        QVERIFY(isInside(&dialog));
        QConfirm question(&screen);
        question.init(QConfirm::SignOut);
        question.show();
        QVERIFY(isInside(&question));
        QToastWidget toast(&screen);
        toast.showText(text);
        QCOMPARE(toast.height(), 240);
        QVERIFY(isInside(&toast));
        AccountManagerHelper::setUserName(QStringLiteral("Anna"));
    }

    void focusComesAndGoes()
    {
        Screen screen;
        QVERIFY(QTest::qWaitForWindowActive(&screen));
        {
            QPopUpForm form(&screen);
            form.initForm(QPopUpForm::POPUP_FORM_COMMENT_INPUT);
            form.show();
            QCOMPARE(QApplication::focusWidget(), form.findChild<QPlainTextEdit *>());
            QPopupDialog notice(&screen);
            notice.setFocusPolicy(Qt::NoFocus);
            notice.initDialog("Notification", "Cable", {"Close"});
            notice.show();
            QCOMPARE(QApplication::focusWidget(), form.findChild<QPlainTextEdit *>());
            form.hide();
            QCOMPARE(QApplication::focusWidget(), &screen);
            form.show();
        }
        QCOMPARE(QApplication::focusWidget(), &screen);
        QConfirm question(&screen);
        question.init(QConfirm::SignOut);
        question.show();
        pressKey(&question, Qt::Key_Tab);
        QCOMPARE(QApplication::focusWidget(), &question);
        screen.setFixedSize(1000, 500);
        QTRY_COMPARE(question.size(), QSize(1000, 500));
    }

    void inputForms()
    {
        for (int kind = QPopUpForm::POPUP_FORM_COMMENT_INPUT;
             kind <= QPopUpForm::POPUP_FORM_TEXT_INPUT; ++kind) {
            LogCapture log;
            QPopUpForm form;
            QSignalSpy finished(&form, &QPopUpForm::editFinished);
            QSignalSpy returned(&form, &QPopUpForm::returnPopUpForm);
            form.initForm(kind, QStringLiteral("abc"));
            form.setInputMode(true);
            KeyRobot robot(&form);
            QCOMPARE(robot.box()->toPlainText(), QStringLiteral("***"));
            robot.press(EnterKey);
            robot.remote(DEVICE_RETURN_KEY);
            QCOMPARE(finished.value(0).value(0).toString(), QStringLiteral("abc"));
            QCOMPARE(returned.size(), 1);
            QVERIFY(log.contains(QStringLiteral("<QPopUpForm::handleInput> texts = abc")));
            QCOMPARE(log.contains(QStringLiteral("<initForm> POPUP_FORM_COMMENT_INPUT")),
                     kind == QPopUpForm::POPUP_FORM_COMMENT_INPUT);
        }
    }

    void confirmForm()
    {
        Screen screen;
        QPopUpForm form(&screen);
        QSignalSpy confirmed(&form, &QPopUpForm::clickConfirm);
        QSignalSpy returned(&form, &QPopUpForm::returnPopUpForm);
        form.initForm(QPopUpForm::POPUP_FORM_CONFIRM, QString(), QConfirm::SignOut);
        form.show();
        auto *question = form.findChild<QConfirm *>();
        QCOMPARE(screen.focusWidget(), question);
        for (int key : {DEVICE_SELECT_KEY, DEVICE_RIGHT_KEY, DEVICE_SELECT_KEY})
            pressKey(question, key);
        QCOMPARE(confirmed.size(), 1);
        QCOMPARE(returned.size(), 1);
        QVERIFY(isInside(&form));
    }

    void listForm()
    {
        LogCapture log;
        QPopUpForm form;
        auto *list = new QPopUpList;
        form.initForm(QPopUpForm::POPUP_FORM_TAG_LIST, list);
        QSignalSpy returned(&form, &QPopUpForm::returnPopUpForm);
        QSignalSpy deleted(&form, &QPopUpForm::delTag);
        QSignalSpy switched(&form, &QPopUpForm::switchProgile);
        QString shared = QStringLiteral("text");
        connect(&form, &QPopUpForm::shareClicked, this, [](QString &text) { text = "changed"; });
        emit list->delItem(3);
        emit list->switchProfile(7);
        emit list->shareComment(shared);
        pressKey(list, DEVICE_RETURN_KEY); // left alone by the list
        QCOMPARE(deleted.value(0).value(0).toInt(), 3);
        QCOMPARE(switched.value(0).value(0).toInt(), 7);
        QCOMPARE(shared, QStringLiteral("changed"));
        QCOMPARE(returned.size(), 1);
        QVERIFY(form.findChild<QContentFrame *>()->isAncestorOf(list));
        QVERIFY(!log.contains(QStringLiteral("Wrong QPopUpForm::initForm()")));
    }

    // Whoever shows a pop-up may delete it at once when it answers.
    void deletedWhileAnswering()
    {
        auto *dialog = new QPopupDialog;
        dialog->initDialog("Title", "Message", {"Close"});
        connect(dialog, &QPopupDialog::accepted, this, [dialog] { delete dialog; });
        pressKey(dialog, DEVICE_SELECT_KEY);
        for (int key : {int(EnterKey), int(DEVICE_RETURN_KEY)}) {
            QPointer<QPopUpForm> form(new QPopUpForm);
            form->initForm(QPopUpForm::POPUP_FORM_TEXT_INPUT);
            connect(form, &QPopUpForm::editFinished, this, [form] { delete form; });
            connect(form, &QPopUpForm::returnPopUpForm, this, [form] { delete form; });
            KeyRobot robot(form);
            if (key == EnterKey)
                robot.press(key);
            else
                robot.remote(key);
            QVERIFY(!form);
        }
    }

    void wrongForms()
    {
        LogCapture log;
        QPopUpForm form;
        form.initForm(99);
        form.initForm(QPopUpForm::POPUP_FORM_TAG_LIST);
        form.initForm(QPopUpForm::POPUP_FORM_CONFIRM, new QPopUpList);
        QCOMPARE(LogCapture::lines().count(QStringLiteral("Wrong QPopUpForm::initForm()")), 3);
        QVERIFY(form.findChildren<QWidget *>().isEmpty());
    }

    void toastGoesByItself()
    {
        QToastWidget toast;
        QSignalSpy finished(&toast, &QToastWidget::finished);
        toast.showText(QStringLiteral("Post successfully!"), 1);
        QVERIFY(toast.isVisible());
        QTRY_COMPARE(finished.size(), 1);
        QVERIFY(!toast.isVisible());
        QCOMPARE(toast.findChild<QLabel *>()->styleSheet(),
                 QStringLiteral("border-image:url(:/res/ToastWin_Bg.png);border-width: "
                                "0px;color:black;"));
    }
};

QTEST_MAIN(tst_Dialogs)
#include "tst_dialogs.moc"
