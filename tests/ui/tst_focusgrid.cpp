#include "common/ui/remotekeys.h"
#include "data/packageproperty.h"
#include "platform/devicestate.h"
#include "support/logcapture.h"
#include "ui/formscrollarea.h"
#include "ui/formscrollwidget.h"
#include "ui/gridowner.h"

#include <QKeyEvent>
#include <QScrollBar>
#include <QSignalSpy>
#include <QVBoxLayout>
#include <QtTest>

namespace {

constexpr int kRowHeight = 100;

// A screen that only notes what the grid asks of it.
class FakeScreen : public QWidget, public GridOwner
{
public:
    void handleGridKey(QKeyEvent *event) override { keys << event->key(); }
    bool isLoading() const override { return loading; }
    bool isMainMenuHidden() const override { return menuHidden; }
    int packageType() const override { return type; }
    int startIndex() const override { return start; }
    int recordCount() const override { return records; }
    bool handlePageUp(int) override
    {
        asked << "page up";
        return hasPages;
    }
    bool handlePageDown(int) override
    {
        asked << "page down";
        return hasPages;
    }
    void changeBlock(bool next) override { asked << (next ? "next block" : "previous block"); }

    QList<int> keys;
    QStringList asked;
    bool loading = false;
    bool menuHidden = false;
    bool hasPages = true;
    int type = TYPE_ALBUM_PHOTOS;
    int start = 9;
    int records = 24;
};

class Cell : public QFrame
{
public:
    Cell()
    {
        setFocusPolicy(Qt::StrongFocus);
        setFixedSize(150, kRowHeight);
    }
};

} // namespace

class TestFocusGrid : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void arrowsMoveTheFocus();
    void downScrollsTheRowIntoView();
    void edgesAskForPages();
    void aRefusedPageLeavesTheFocus();
    void hiddenCellsAreNeverFocused();
    void keysAreRefused_data();
    void keysAreRefused();
    void someKeysGoToTheScreen();
    void redGoesHome();
    void selectPressesTheCell();
    void withoutAFocusedCell();
    void cellsNeedColumns();

private:
    void press(int key)
    {
        QTest::sendKeyEvent(QTest::Press, focused(), Qt::Key(key), QString(), {});
    }
    QWidget *focused() { return mScreen->focusWidget() ? mScreen->focusWidget() : mGrid; }
    int index() const { return mContent->getIndex(); }
    void focus(int cell)
    {
        QVERIFY(mContent->setIndex(cell));
        mGrid->initFocus();
        QVERIFY(mContent->cell(cell)->hasFocus());
    }
    void hideFrom(int first)
    {
        for (int i = 0; i < mContent->count(); ++i)
            mContent->cell(i)->setVisible(i < first);
    }

    std::unique_ptr<FakeScreen> mScreen;
    FormScrollArea *mGrid = nullptr;
    FormScrollWidget *mContent = nullptr;
};

void TestFocusGrid::init()
{
    NetworkCableStatus = true;
    mScreen = std::make_unique<FakeScreen>();
    auto *outer = new QVBoxLayout(mScreen.get());
    outer->setContentsMargins(0, 0, 0, 0);
    auto *frame = new QFrame(mScreen.get());
    outer->addWidget(frame);
    auto *inner = new QVBoxLayout(frame);
    inner->setContentsMargins(0, 0, 0, 0);
    mGrid = new FormScrollArea(frame);
    inner->addWidget(mGrid);
    mContent = new FormScrollWidget(mGrid);
    mGrid->setWidget(mContent);
    mContent->setColumn(4);
    for (int i = 0; i < 12; ++i)
        mContent->addItem(new Cell, i);
    mScreen->resize(600, 250);
    mScreen->show();
    QVERIFY(QTest::qWaitForWindowActive(mScreen.get()));
    focus(0);
}

void TestFocusGrid::cleanup()
{
    NetworkCableStatus = true;
    mScreen.reset();
}

void TestFocusGrid::arrowsMoveTheFocus()
{
    QSignalSpy moved(mGrid, &FormScrollArea::selectChanged);
    for (int key : {DEVICE_RIGHT_KEY, DEVICE_DOWN_KEY, DEVICE_LEFT_KEY, DEVICE_UP_KEY})
        press(key);
    QCOMPARE(moved.size(), 4);
    QCOMPARE(moved.at(0).at(0).toInt(), 1);
    QCOMPARE(moved.at(1).at(0).toInt(), 5);
    QCOMPARE(moved.at(2).at(0).toInt(), 4);
    QCOMPARE(moved.at(3).at(0).toInt(), 0);
    QVERIFY(mContent->cell(0)->hasFocus());
    QVERIFY(mScreen->asked.isEmpty());
}

void TestFocusGrid::downScrollsTheRowIntoView()
{
    press(DEVICE_DOWN_KEY);
    QCOMPARE(mGrid->verticalScrollBar()->value(), 0);
    press(DEVICE_DOWN_KEY);
    QCOMPARE(mGrid->verticalScrollBar()->value(), 3 * kRowHeight - 250);
    press(DEVICE_UP_KEY);
    QCOMPARE(mGrid->verticalScrollBar()->value(), 3 * kRowHeight - 250);
    press(DEVICE_UP_KEY);
    QCOMPARE(mGrid->verticalScrollBar()->value(), 0);
}

void TestFocusGrid::edgesAskForPages()
{
    press(DEVICE_LEFT_KEY);
    QCOMPARE(index(), 11);
    press(DEVICE_RIGHT_KEY);
    QCOMPARE(index(), 0);
    QCOMPARE(mGrid->verticalScrollBar()->value(), 0);
    focus(9);
    press(DEVICE_DOWN_KEY);
    QCOMPARE(index(), 0);
    focus(5);
    press(DEVICE_PAGEUP_KEY);
    QCOMPARE(index(), 0);
    QCOMPARE(mScreen->asked, QStringList({"page up", "page down", "page down", "page up"}));

    mScreen->asked.clear();
    mScreen->type = TYPE_SEARCH_MORE_PHOTOS;
    mScreen->start = 101;
    LogCapture log;
    press(DEVICE_LEFT_KEY);
    mScreen->start = 197;
    mScreen->records = 100;
    press(DEVICE_PAGEDOWN_KEY);
    QCOMPARE(mScreen->asked, QStringList({"previous block", "next block"}));
    QVERIFY(log.contains("FormScrollArea::keyPressEvent() DEVICE_LEFT_KEY: get previous page"));
    QVERIFY(log.contains("FormScrollArea::keyPressEvent() DEVICE_PAGEDOWN_KEY: get next page"));
}

void TestFocusGrid::aRefusedPageLeavesTheFocus()
{
    mScreen->hasPages = false;
    QSignalSpy moved(mGrid, &FormScrollArea::selectChanged);
    focus(11);
    for (int key : {DEVICE_RIGHT_KEY, DEVICE_DOWN_KEY, DEVICE_PAGEUP_KEY, DEVICE_PAGEDOWN_KEY})
        press(key);
    QCOMPARE(index(), 11);
    QCOMPARE(mScreen->asked.size(), 4);
    QVERIFY(moved.isEmpty());
}

void TestFocusGrid::hiddenCellsAreNeverFocused()
{
    hideFrom(6);
    focus(5);
    LogCapture log;
    press(DEVICE_RIGHT_KEY);
    QCOMPARE(index(), 5);
    QVERIFY(log.contains("FormScrollWidget::setIndex this item is hide mIndex=6"));
    QVERIFY(log.contains("DEVICE_RIGHT_KEY set index wrong"));
    press(DEVICE_DOWN_KEY);
    QVERIFY(log.contains("DEVICE_DOWN_KEY set index wrong"));

    mScreen->type = TYPE_SEARCH_PHOTOS;
    press(DEVICE_RIGHT_KEY);
    QCOMPARE(mScreen->asked, QStringList("next block"));

    hideFrom(2);
    QCOMPARE(index(), 0);
    QVERIFY(mContent->cell(0)->hasFocus());
}

void TestFocusGrid::keysAreRefused_data()
{
    QTest::addColumn<bool>("cable");
    QTest::addColumn<bool>("loading");
    QTest::addColumn<int>("columns");
    QTest::addColumn<QString>("line");

    QTest::newRow("cable out") << false << true << 4 << "network has plug out.reject select key";
    QTest::newRow("loading") << true << true << 4
                             << "it is downloading data now, so no key press events!";
    QTest::newRow("five columns") << true << false << 5 << "column wrong! column now is 5";
}

void TestFocusGrid::keysAreRefused()
{
    QFETCH(bool, cable);
    QFETCH(bool, loading);
    QFETCH(int, columns);
    QFETCH(QString, line);
    NetworkCableStatus = cable;
    mScreen->loading = loading;
    mContent->setColumn(columns);
    LogCapture log;
    press(DEVICE_RIGHT_KEY);
    QVERIFY(log.contains(line));
    press(DEVICE_RETURN_KEY);
    QCOMPARE(index(), 0);
    QCOMPARE(mScreen->keys.size(), columns == 5 ? 1 : 0);
    QVERIFY(mScreen->asked.isEmpty());
}

void TestFocusGrid::someKeysGoToTheScreen()
{
    for (int key : {DEVICE_RETURN_KEY, DEVICE_PLAY_KEY, DEVICE_PLAYPAUSE_KEY, DEVICE_UP_KEY})
        press(key);
    QCOMPARE(mScreen->keys,
             QList<int>({DEVICE_RETURN_KEY, DEVICE_PLAY_KEY, DEVICE_PLAYPAUSE_KEY, DEVICE_UP_KEY}));
    press(DEVICE_SETTING_KEY);
    QCOMPARE(mScreen->keys.size(), 4);
    QCOMPARE(index(), 0);
}

void TestFocusGrid::redGoesHome()
{
    QSignalSpy moved(mGrid, &FormScrollArea::selectChanged);
    focus(3);
    mScreen->menuHidden = true;
    press(DEVICE_RED_KEY);
    QCOMPARE(index(), 3);
    mScreen->menuHidden = false;
    press(DEVICE_RED_KEY);
    QCOMPARE(mScreen->keys, QList<int>({DEVICE_RED_KEY}));
    QVERIFY(mContent->cell(0)->hasFocus());
    QVERIFY(moved.isEmpty());
}

void TestFocusGrid::selectPressesTheCell()
{
    QSignalSpy pressed(mGrid, &FormScrollArea::enterPress);
    focus(6);
    press(DEVICE_SELECT_KEY);
    QCOMPARE(pressed.size(), 1);
    QCOMPARE(pressed.at(0), QVariantList({6, true}));
}

void TestFocusGrid::withoutAFocusedCell()
{
    QVERIFY(!mContent->setIndex(-1));
    for (int key :
         {DEVICE_LEFT_KEY, DEVICE_UP_KEY, DEVICE_RIGHT_KEY, DEVICE_DOWN_KEY, DEVICE_SELECT_KEY})
        press(key);
    QCOMPARE(mScreen->keys, QList<int>({DEVICE_LEFT_KEY, DEVICE_UP_KEY, DEVICE_RIGHT_KEY}));

    LogCapture log;
    mGrid->setFocus();
    QVERIFY(mGrid->hasFocus());
    QVERIFY(log.contains("<lwj> not set focus"));
    mGrid->updateFocus();
    QVERIFY(mContent->cell(0)->hasFocus());
    QVERIFY(log.contains("set foucs on the first photo in search page"));
}

void TestFocusGrid::cellsNeedColumns()
{
    FormScrollWidget content;
    QVERIFY(!content.setColumn(0));
    QCOMPARE(content.column(), -1);
    LogCapture log;
    Cell cell;
    content.addItem(&cell, 0);
    QVERIFY(log.contains("set mColumn first"));
    QCOMPARE(content.getIndex(), -1);
    content.setColumn(2);
    content.addItem(new Cell, 0);
    QVERIFY(log.contains("ScrollWidget not has parentWidget()"));
    QCOMPARE(content.count(), 1);
}

QTEST_MAIN(TestFocusGrid)
#include "tst_focusgrid.moc"
