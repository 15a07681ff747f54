#include "common/ui/remotekeys.h"
#include "data/testconfig.h"
#include "ui/upwidget.h"

#include <QKeyEvent>
#include <QSignalSpy>
#include <QtTest>

using Look = TitleIcon::Look;

class TestUpWidget : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void entriesAskForLists_data();
    void entriesAskForLists();
    void theMarkStopsAtBothEnds();
    void entriesAreStyled();
    void theMarkReturnsToTheSelection();
    void signingOutCanBeCancelled();
    void someKeysArePassedOn();
    void longNamesAreCut();

private:
    void press(int key)
    {
        QTest::sendKeyEvent(QTest::Press, mBar.get(), Qt::Key(key), QString(), {});
    }
    bool looks(int entry, Look look) const
    {
        const TitleIcon *icon = mBar->entry(entry);
        return icon->styleSheet() == TitleIcon::style(look, icon->isSignOut);
    }

    TestConfig mConfig;
    std::unique_ptr<UpWidget> mBar;
    QList<PackageProperty> mAsked;
};

void TestUpWidget::init()
{
    mBar = std::make_unique<UpWidget>();
    mAsked.clear();
    connect(mBar.get(), &UpWidget::pressEnter, this,
            [this](PackageProperty &property) { mAsked << property; });
}

void TestUpWidget::entriesAskForLists_data()
{
    QTest::addColumn<int>("entry");
    QTest::addColumn<int>("type");
    QTest::addColumn<QString>("user");

    QTest::newRow("Home") << 0 << int(TYPE_FEATURED_PHOTOS) << QString();
    QTest::newRow("My Photos") << 1 << int(TYPE_ALBUM_LIST) << "default";
    QTest::newRow("Favorites") << 2 << int(TYPE_FAVORITE_PEOPLE) << "default";
    QTest::newRow("Search") << 3 << int(TYPE_SEARCH_PHOTOS) << QString();
}

void TestUpWidget::entriesAskForLists()
{
    QFETCH(int, entry);
    for (int i = 0; i < entry; ++i)
        press(DEVICE_RIGHT_KEY);
    QVERIFY(mAsked.isEmpty());
    press(DEVICE_SELECT_KEY);
    QCOMPARE(mAsked.size(), 1);
    QTEST(mAsked.at(0).mType, "type");
    QTEST(mAsked.at(0).mUserId, "user");
    QCOMPARE(mAsked.at(0).mStartIndex, 1);
    QCOMPARE(mAsked.at(0).mItemsPerPage, 8);
    QCOMPARE(mBar->selectedIndex(), entry);
    QCOMPARE(mBar->entry(entry)->text(), QString(QTest::currentDataTag()));
}

void TestUpWidget::theMarkStopsAtBothEnds()
{
    press(DEVICE_LEFT_KEY);
    QCOMPARE(mBar->focusIndex(), 0);
    for (int i = 0; i < 6; ++i)
        press(DEVICE_RIGHT_KEY);
    QCOMPARE(mBar->focusIndex(), 4);
    QCOMPARE(mBar->selectedIndex(), 0);
}

void TestUpWidget::entriesAreStyled()
{
    QVERIFY(looks(0, Look::FocusedSelected));
    press(DEVICE_RIGHT_KEY);
    QVERIFY(looks(0, Look::Selected));
    QVERIFY(looks(1, Look::Focused));
    press(DEVICE_SELECT_KEY);
    QVERIFY(looks(0, Look::Normal));
    QVERIFY(looks(1, Look::FocusedSelected));
    for (int i = 0; i < 3; ++i)
        press(DEVICE_RIGHT_KEY);
    QVERIFY(looks(3, Look::Normal));
    QVERIFY(looks(4, Look::Focused));
    press(DEVICE_SELECT_KEY);
    QVERIFY(looks(4, Look::FocusedSelected));
    QVERIFY(looks(1, Look::Normal));
    press(DEVICE_LEFT_KEY);
    QVERIFY(looks(3, Look::Focused));
    QVERIFY(looks(4, Look::Selected));
}

void TestUpWidget::theMarkReturnsToTheSelection()
{
    press(DEVICE_RIGHT_KEY);
    press(DEVICE_SELECT_KEY);
    press(DEVICE_RIGHT_KEY);
    QFocusEvent out(QEvent::FocusOut), in(QEvent::FocusIn);
    QCoreApplication::sendEvent(mBar.get(), &out);
    QVERIFY(looks(1, Look::Selected));
    QVERIFY(looks(2, Look::Normal));
    QCoreApplication::sendEvent(mBar.get(), &in);
    QCOMPARE(mBar->focusIndex(), 1);
    QVERIFY(looks(1, Look::FocusedSelected));
}

void TestUpWidget::signingOutCanBeCancelled()
{
    QSignalSpy signOut(mBar.get(), &UpWidget::signOutRequested);
    press(DEVICE_RIGHT_KEY);
    press(DEVICE_SELECT_KEY);
    for (int i = 0; i < 3; ++i)
        press(DEVICE_RIGHT_KEY);
    press(DEVICE_SELECT_KEY);
    QCOMPARE(signOut.size(), 1);
    QCOMPARE(mAsked.size(), 1);
    mBar->cancelSignOut();
    QCOMPARE(mBar->focusIndex(), 1);
    QCOMPARE(mBar->selectedIndex(), 1);
    QVERIFY(looks(1, Look::FocusedSelected));
    QVERIFY(looks(4, Look::Normal));
    mBar->cancelSignOut();
    QCOMPARE(mBar->selectedIndex(), 1);
}

void TestUpWidget::someKeysArePassedOn()
{
    QList<int> passed;
    connect(mBar.get(), &UpWidget::keyPassedOn, this,
            [&passed](QKeyEvent *event) { passed << event->key(); });
    const QList<int> keys{DEVICE_PLAY_KEY,   DEVICE_PAGEUP_KEY, DEVICE_PAGEDOWN_KEY,
                          DEVICE_RETURN_KEY, DEVICE_RED_KEY,    DEVICE_PLAYPAUSE_KEY};
    for (int key : keys)
        press(key);
    QCOMPARE(passed, keys);
    for (int key : {DEVICE_UP_KEY, DEVICE_DOWN_KEY}) {
        QKeyEvent event(QEvent::KeyPress, key, Qt::NoModifier);
        QCoreApplication::sendEvent(mBar.get(), &event);
        QVERIFY(!event.isAccepted());
    }
    QCOMPARE(mBar->focusIndex(), 0);
}

void TestUpWidget::longNamesAreCut()
{
    mBar->setUserName("<b>Al</b>");
    QCOMPARE(mBar->shownUserName(), QString("<b>Al</b>"));
    const QString name(100000, 'W');
    mBar->setUserName(name);
    QVERIFY(mBar->shownUserName().size() < 40);
    QVERIFY(mBar->shownUserName().endsWith(QChar(0x2026)));
}

QTEST_MAIN(TestUpWidget)
#include "tst_upwidget.moc"
