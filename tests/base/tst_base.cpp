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
    row("last title", 0, 13, "Unknown User");
    row("leading blanks", 2, 0, "    Message content");
    row("trailing line break", 2, 10, "  Are you sure to logout your account:\n");
    row("last label", 2, 29, "Please register on PC and try again later.\n");
    row("quotes inside", 5, 10,
        "You have do some incorrect operations, please press \"Return\" to authorize your account "
        "again!");
    row("long text", 6, 2,
        "Account Manager can simplify your login process to Orvala. Please enter your local login "
        "ID and protection code.");
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
