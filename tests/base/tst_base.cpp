#include "base/i18n.h"

#include <QTest>

class TestBase : public QObject
{
    Q_OBJECT

private slots:
    void looksTextsUp_data();
    void looksTextsUp();
};

void TestBase::looksTextsUp_data()
{
    QTest::addColumn<int>("table");
    QTest::addColumn<int>("index");
    QTest::addColumn<QString>("text");

    const auto row = [](const char *name, int table, int index, const char *text) {
        QTest::newRow(name) << table << index << QString::fromLatin1(text);
    };
    row("last login text", 6, 11,
        "This account is exist, please input correct password to authorize it.");
    row("no table 1", 1, 0, "Unkown");
    row("table below zero", -1, 0, "Unkown");
    row("title index too high", 0, 14, "Unknown");
    row("login index too high", 6, 12, "Unknown");
    row("index below zero", 6, -1, "Unknown");
}

void TestBase::looksTextsUp()
{
    QFETCH(int, table);
    QFETCH(int, index);
    QTEST(I18n::text(table, index), "text");
}

QTEST_APPLESS_MAIN(TestBase)
#include "tst_base.moc"
