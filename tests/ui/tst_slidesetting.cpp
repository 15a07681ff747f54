#include "ui/screencase.h"
#include "ui/settingitem.h"
#include "ui/slidesetting.h"

#include <QPushButton>

// The panel by key presses.
class TestSlideSetting : public ScreenCase
{
    Q_OBJECT

private slots:
    void init();
    void focusMoves_data();
    void focusMoves();
    void valuesStopAtTheirEnds();

private:
    SettingItem *row(int index) const { return mPanel->findChildren<SettingItem *>().at(index); }
    QString focused() const
    {
        if (const auto *button = qobject_cast<QPushButton *>(QApplication::focusWidget()))
            return button->text();
        return QApplication::focusWidget() == row(0) ? "mode" : "speed";
    }

    std::unique_ptr<SlideSetting> mPanel;
};

void TestSlideSetting::init()
{
    SlideSetting::SlideMode = 0;
    SlideSetting::SlideSpeed = 6;
    mPanel = std::make_unique<SlideSetting>();
    show(mPanel.get());
    mPanel->load();
}

void TestSlideSetting::focusMoves_data()
{
    QTest::addColumn<QVector<int>>("keys");
    QTest::addColumn<QString>("end");

    const int up = DEVICE_UP_KEY, down = DEVICE_DOWN_KEY;
    const int left = DEVICE_LEFT_KEY, right = DEVICE_RIGHT_KEY;
    QTest::newRow("to Cancel") << QVector<int>{right} << "Cancel";
    QTest::newRow("not beyond Cancel") << QVector<int>{right, right, down} << "Cancel";
    QTest::newRow("back to OK") << QVector<int>{right, left, left} << "OK";
    QTest::newRow("up from OK") << QVector<int>{up} << "speed";
    QTest::newRow("up from Cancel") << QVector<int>{right, up} << "speed";
    QTest::newRow("to the top") << QVector<int>{up, up, up} << "mode";
    QTest::newRow("sideways in a row") << QVector<int>{up, left, right} << "speed";
    QTest::newRow("up and down") << QVector<int>{up, up, down, down} << "OK";
    QTest::newRow("not below OK") << QVector<int>{down} << "OK";
}

void TestSlideSetting::focusMoves()
{
    QFETCH(QVector<int>, keys);
    for (int key : qAsConst(keys))
        press({key});
    QTEST(focused(), "end");
}

void TestSlideSetting::valuesStopAtTheirEnds()
{
    press({DEVICE_UP_KEY, DEVICE_SELECT_KEY, DEVICE_UP_KEY, DEVICE_UP_KEY});
    QCOMPARE(mPanel->speed(), 5);
    row(1)->setValue(SettingItem::Number, INT_MAX);
    press({DEVICE_SELECT_KEY, DEVICE_DOWN_KEY});
    QCOMPARE(mPanel->speed(), INT_MAX);
    press({DEVICE_SELECT_KEY, DEVICE_UP_KEY, DEVICE_SELECT_KEY, DEVICE_UP_KEY});
    QCOMPARE(mPanel->mode(), 0);
    press({DEVICE_DOWN_KEY, DEVICE_DOWN_KEY, DEVICE_DOWN_KEY});
    QCOMPARE(mPanel->mode(), 2);
}

QTEST_MAIN(TestSlideSetting)
#include "tst_slidesetting.moc"
