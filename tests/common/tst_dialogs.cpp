#include "accountmanager/accountmanagerhelper.h"
#include "common/keyrobot.h"
#include "common/ui/qconfirm.h"
#include "common/ui/qpopupdialog.h"
#include "common/ui/qpopupform.h"
#include "common/ui/qtoastwidget.h"
#include "network/systemconfig.h"
#include "res/resources.h"

#include <QLabel>
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

    // Whether every visible part lies inside the screen and no text needs more than its place.
    static bool isInside(QWidget *dialog)
    {
        for (QWidget *part : dialog->findChildren<QWidget *>()) {
            const QRect place(part->mapTo(dialog, QPoint()), part->size());
            if (part->isVisible() && !dialog->rect().contains(place))
                return false;
            const auto *label = qobject_cast<QLabel *>(part);
            if (label && (label->textFormat() != Qt::PlainText ||
                          label->sizeHint().boundedTo(label->size()) != label->sizeHint()))
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
        AccountManagerHelper::setUserName("Anna");
    }

    void questions()
    {
        QConfirm question;
        QSignalSpy yes(&question, &QConfirm::clickConfirm);
        QSignalSpy no(&question, &QConfirm::clickCancel);
        question.init(QConfirm::DeleteTag, "sun &amp; sea");
        QVERIFY(question.findChildren<QLabel *>().at(1)->text().endsWith("sun & sea"));
        for (int key : {DEVICE_LEFT_KEY, DEVICE_SELECT_KEY, DEVICE_RIGHT_KEY, DEVICE_RIGHT_KEY,
                        DEVICE_SELECT_KEY, DEVICE_RETURN_KEY, DEVICE_UP_KEY})
            pressKey(&question, key);
        QCOMPARE(yes.size(), 1);
        QCOMPARE(no.size(), 1);
    }

    void textsStayInside_data()
    {
        QTest::addColumn<QString>("text");
        QTest::newRow("words") << QString("many words ").repeated(1000);
        QTest::newRow("one word") << QString(10000, 'W');
        QTest::newRow("right to left") << QString("האלבום של המשפחה, קיץ 2024 ").repeated(400);
        QTest::newRow("emoji")
            << QString("👨‍👩‍👧‍👦🏖️ summer 日本 ").repeated(400);
        QTest::newRow("line ends") << QString("a\r\n\u2029\n").repeated(2000);
        QTest::newRow("markup") << QString("<table><tr><td><img src=x>").repeated(400);
        QTest::newRow("without width") << QString(10000, QChar(0x200b));
        QTest::newRow("half a pair") << QString(10000, QChar(0xd83d));
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
        for (int asked : {QConfirm::SignOut, QConfirm::DeleteTag}) {
            QConfirm question(&screen);
            question.init(asked, text);
            question.show();
            QVERIFY(isInside(&question));
        }
        QToastWidget toast(&screen);
        toast.showText(text);
        QCOMPARE(toast.height(), 240);
        QVERIFY(isInside(&toast));
        AccountManagerHelper::setUserName("Anna");
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
            key == EnterKey ? robot.press(key) : robot.remote(key);
            QVERIFY(!form);
        }
    }
};

QTEST_MAIN(tst_Dialogs)
#include "tst_dialogs.moc"
