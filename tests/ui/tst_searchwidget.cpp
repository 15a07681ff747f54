#include "common/ui/remotekeys.h"
#include "data/testconfig.h"
#include "support/logcapture.h"
#include "ui/searchwidget.h"

#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QSignalSpy>
#include <QVBoxLayout>
#include <QtTest>

namespace {

// Notes the keys that the bar leaves to its screen.
class Screen : public QWidget
{
public:
    QList<int> keys;

protected:
    void keyPressEvent(QKeyEvent *event) override { keys << event->key(); }
};

} // namespace

class TestSearchWidget : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void isAsLargeAsItShould();
    void anEmptyFieldCannotBeSearchedFor();
    void searchesForTheWords();
    void returningLandsOnTheField();
    void leavesSomeKeysToTheScreen();

private:
    void press(int key) { QTest::sendKeyEvent(QTest::Press, mBar, Qt::Key(key), QString(), {}); }
    bool isFieldMarked() const { return field()->styleSheet().contains("green"); }
    bool isButtonMarked() const { return button()->styleSheet().contains("green"); }
    QLineEdit *field() const { return mBar->findChild<QLineEdit *>(); }
    QLabel *button() const { return mBar->findChild<QLabel *>(); }

    TestConfig mConfig;
    LogCapture mLog;
    std::unique_ptr<Screen> mScreen;
    QWidget *mOther = nullptr;
    SearchWidget *mBar = nullptr;
};

void TestSearchWidget::init()
{
    mScreen = std::make_unique<Screen>();
    auto *rows = new QVBoxLayout(mScreen.get());
    mOther = new QWidget;
    mOther->setFocusPolicy(Qt::StrongFocus);
    mBar = new SearchWidget;
    rows->addWidget(mOther);
    rows->addWidget(mBar);
    mScreen->show();
    QVERIFY(QTest::qWaitForWindowActive(mScreen.get()));
    mBar->setFocus();
}

void TestSearchWidget::cleanup()
{
    mScreen.reset();
}

void TestSearchWidget::isAsLargeAsItShould()
{
    QCOMPARE(mBar->size(), QSize(1280, 490));
    QCOMPARE(field()->size(), QSize(480, 60));
    QCOMPARE(button()->size(), QSize(60, 60));
    QCOMPARE(button()->x(), field()->geometry().right() + 1 + mBar->layout()->spacing());
    QVERIFY(qAbs(field()->x() + button()->geometry().right() - 1280) <= 2); // in the middle
}

void TestSearchWidget::anEmptyFieldCannotBeSearchedFor()
{
    QSignalSpy asked(mBar, &SearchWidget::showInputDialog);
    QSignalSpy started(mBar, &SearchWidget::startSearch);
    QVERIFY(isFieldMarked());
    press(DEVICE_RIGHT_KEY);
    QVERIFY(isFieldMarked() && !isButtonMarked());
    QVERIFY(!button()->isEnabled());
    press(DEVICE_SELECT_KEY);
    QCOMPARE(asked.size(), 1);
    QVERIFY(started.isEmpty());
}

void TestSearchWidget::searchesForTheWords()
{
    QSignalSpy started(mBar, &SearchWidget::startSearch);
    mBar->setText("sea & sun");
    press(DEVICE_RIGHT_KEY);
    QVERIFY(isButtonMarked() && !isFieldMarked());
    press(DEVICE_SELECT_KEY);
    QCOMPARE(started.value(0), QVariantList({"sea & sun"}));
    press(DEVICE_LEFT_KEY);
    QVERIFY(isFieldMarked() && !isButtonMarked());
    mBar->setText(QString());
    QVERIFY(!button()->isEnabled());
    QVERIFY(!isFieldMarked());
}

void TestSearchWidget::returningLandsOnTheField()
{
    mBar->setText("sea");
    press(DEVICE_RIGHT_KEY);
    mOther->setFocus();
    QVERIFY(!isFieldMarked() && !isButtonMarked());
    QCOMPARE(mBar->styleSheet(), QString("QFrame{border-width: 0px;}QLabel{border-width: 1px}"));
    mBar->setFocus();
    QVERIFY(isFieldMarked());
    QCOMPARE(mBar->styleSheet(), QString("QLabel{border-width: 2px}"));
}

void TestSearchWidget::leavesSomeKeysToTheScreen()
{
    for (int key : {DEVICE_UP_KEY, DEVICE_DOWN_KEY, DEVICE_RED_KEY, DEVICE_PLAY_KEY,
                    DEVICE_RETURN_KEY, DEVICE_PAGEDOWN_KEY})
        press(key);
    QCOMPARE(mScreen->keys, QList<int>({DEVICE_UP_KEY, DEVICE_RED_KEY, DEVICE_RETURN_KEY}));
}

QTEST_MAIN(TestSearchWidget)
#include "tst_searchwidget.moc"
