#include "common/ui/remotekeys.h"
#include "data/packageproperty.h"
#include "ui/gridfocus.h"

#include <QtTest>

using gridfocus::Move;

Q_DECLARE_METATYPE(gridfocus::Situation)

namespace {

gridfocus::Situation photos(int index, int count, int startIndex = 1)
{
    return {index, count, 4, TYPE_ALBUM_PHOTOS, startIndex, count};
}

gridfocus::Situation search(int type, int index, int startIndex, int records)
{
    return {index, 8, 4, type, startIndex, records};
}

} // namespace

class TestGridFocus : public QObject
{
    Q_OBJECT

private slots:
    void aKeyLeadsToAStep_data();
    void aKeyLeadsToAStep();
    void aHiddenCellGivesItsFocusAway();
    void theFocusedRowScrollsIntoView();
};

void TestGridFocus::aKeyLeadsToAStep_data()
{
    QTest::addColumn<int>("key");
    QTest::addColumn<gridfocus::Situation>("at");
    QTest::addColumn<int>("move");
    QTest::addColumn<int>("target");
    QTest::addColumn<int>("otherwise");
    const auto row = [](const char *name, int key, const gridfocus::Situation &at, Move move,
                        int target = -1, Move otherwise = Move::Drop) {
        QTest::newRow(name) << key << at << int(move) << target << int(otherwise);
    };
    const int more = TYPE_SEARCH_MORE_PHOTOS, first = TYPE_SEARCH_PHOTOS;

    row("left of the first cell", DEVICE_LEFT_KEY, photos(0, 7), Move::PageUp, 6);
    row("left of a block", DEVICE_LEFT_KEY, search(more, 0, 101, 100), Move::PreviousBlock);
    row("left of the first block", DEVICE_LEFT_KEY, search(more, 0, 1, 100), Move::PageUp, 7);
    row("left of a first search", DEVICE_LEFT_KEY, search(first, 0, 101, 100), Move::PageUp, 7);
    row("right of the last cell", DEVICE_RIGHT_KEY, photos(7, 8), Move::PageDown, 0);
    row("right in a search", DEVICE_RIGHT_KEY, search(first, 2, 1, 100), Move::Focus, 3,
        Move::NextBlock);

    row("up from the first row", DEVICE_UP_KEY, photos(3, 8), Move::ToOwner);
    row("up in a first search", DEVICE_UP_KEY, search(first, 4, 1, 100), Move::Focus, 0);
    row("up in a later search page", DEVICE_UP_KEY, search(first, 4, 9, 100), Move::Focus, 0,
        Move::PreviousBlock);
    row("up in further results", DEVICE_UP_KEY, search(more, 4, 1, 100), Move::Focus, 0,
        Move::PreviousBlock);
    row("down to a short row", DEVICE_DOWN_KEY, photos(3, 7), Move::Focus, 4);
    row("down from the last row", DEVICE_DOWN_KEY, photos(4, 7), Move::PageDown, 0);
    row("down in a search", DEVICE_DOWN_KEY, search(more, 0, 1, 100), Move::Focus, 4,
        Move::NextBlock);

    row("page up of a block", DEVICE_PAGEUP_KEY, search(more, 3, 201, 9), Move::PreviousBlock);
    row("page down", DEVICE_PAGEDOWN_KEY, photos(5, 8), Move::PageDown, 0);
    row("page down in a search", DEVICE_PAGEDOWN_KEY, search(first, 0, 89, 100), Move::PageDown, 0);
    row("page down of a block", DEVICE_PAGEDOWN_KEY, search(more, 0, 197, 100), Move::NextBlock);
}

void TestGridFocus::aKeyLeadsToAStep()
{
    QFETCH(int, key);
    QFETCH(gridfocus::Situation, at);
    const gridfocus::Step step = gridfocus::step(key, at);
    QTEST(int(step.move), "move");
    QTEST(step.target, "target");
    QTEST(int(step.otherwise), "otherwise");
}

void TestGridFocus::aHiddenCellGivesItsFocusAway()
{
    const auto repaired = [](int index, int columns, int firstHidden) {
        const auto isHidden = [firstHidden](int cell) { return cell >= firstHidden; };
        return gridfocus::repaired(index, 8, columns, isHidden);
    };
    QCOMPARE(repaired(5, 4, 6), 5);
    QCOMPARE(repaired(6, 4, 4), 2);  // a row up
    QCOMPARE(repaired(7, 4, 3), 0);  // hidden there too
    QCOMPARE(repaired(2, 4, 1), 0);  // in the first row
    QCOMPARE(repaired(2, -1, 1), 0); // no columns yet
    QCOMPARE(repaired(9, 4, 8), 5);  // beyond the list
}

void TestGridFocus::theFocusedRowScrollsIntoView()
{
    const auto positions = [](int row, int contentTop) {
        const gridfocus::Rows rows{200, contentTop, 500};
        return QVector<int>{gridfocus::scrollUp(row, rows), gridfocus::scrollDown(row, rows),
                            gridfocus::scrollInto(row, rows)};
    };
    QCOMPARE(positions(0, 0), QVector<int>({0, 0, -1}));
    QCOMPARE(positions(1, -100), QVector<int>({-1, -1, -1}));  // inside
    QCOMPARE(positions(2, 0), QVector<int>({400, 104, 104}));  // below the edge
    QCOMPARE(positions(1, -300), QVector<int>({200, 0, 200})); // above it
}

QTEST_APPLESS_MAIN(TestGridFocus)
#include "tst_gridfocus.moc"
