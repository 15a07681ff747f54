#include "common/ui/remotekeys.h"
#include "data/packageproperty.h"
#include "platform/devicestate.h"
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
    void changeBlock(bool) override { asked << "block"; }

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
    void downScrollsTheRowIntoView();
    void edgesAskForPages();
    void aRefusedPageLeavesTheFocus();
    void hiddenCellsAreNeverFocused();
    void keysAreRefused_data();
    void keysAreRefused();
    void redGoesHome();
    void withoutAFocusedCell();

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
    press(DEVICE_RIGHT_KEY);
    press(DEVICE_DOWN_KEY);
    QCOMPARE(index(), 5);
    mScreen->type = TYPE_SEARCH_PHOTOS;
    press(DEVICE_RIGHT_KEY);
    QCOMPARE(mScreen->asked, QStringList("block"));

    hideFrom(2);
    QCOMPARE(index(), 0);
    QVERIFY(mContent->cell(0)->hasFocus());
}

void TestFocusGrid::keysAreRefused_data()
{
    QTest::addColumn<bool>("cable");
    QTest::addColumn<bool>("loading");
    QTest::addColumn<int>("columns");

    QTest::newRow("cable out") << false << false << 4;
    QTest::newRow("loading") << true << true << 4;
    QTest::newRow("five columns") << true << false << 5;
}

void TestFocusGrid::keysAreRefused()
{
    QFETCH(bool, cable);
    QFETCH(bool, loading);
    QFETCH(int, columns);
    NetworkCableStatus = cable;
    mScreen->loading = loading;
    mContent->setColumn(columns);
    press(DEVICE_RIGHT_KEY);
    press(DEVICE_RETURN_KEY);
    QCOMPARE(index(), 0);
    QCOMPARE(mScreen->keys.size(), columns == 5 ? 1 : 0);
    QVERIFY(mScreen->asked.isEmpty());
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

void TestFocusGrid::withoutAFocusedCell()
{
    QVERIFY(!mContent->setIndex(-1));
    for (int key :
         {DEVICE_LEFT_KEY, DEVICE_UP_KEY, DEVICE_RIGHT_KEY, DEVICE_DOWN_KEY, DEVICE_SELECT_KEY})
        press(key);
    QCOMPARE(mScreen->keys, QList<int>({DEVICE_LEFT_KEY, DEVICE_UP_KEY, DEVICE_RIGHT_KEY}));

    mGrid->setFocus();
    QVERIFY(mGrid->hasFocus());
    mGrid->updateFocus();
    QVERIFY(mContent->cell(0)->hasFocus());
}

QTEST_MAIN(TestFocusGrid)
#include "tst_focusgrid.moc"
