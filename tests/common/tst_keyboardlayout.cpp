#include "common/ui/keyboardlayout.h"

#include <QSet>
#include <QTest>

class tst_KeyboardLayout : public QObject
{
    Q_OBJECT

    // What every page together can type.
    static QSet<QString> everyText()
    {
        QSet<QString> texts;
        for (int page = 0; page < kPageCount; ++page) {
            for (int i = 0; i < kKeyCount; ++i)
                texts << keyText(KeyboardPage(page), i);
        }
        return texts;
    }

private slots:
    void moves_data()
    {
        QTest::addColumn<int>("arrow");
        QTest::addColumn<QList<int>>("expected"); // for each of the 55 keys
        const auto counted = [](int first, int last) {
            QList<int> numbers;
            for (int i = first; i <= last; ++i)
                numbers << i;
            return numbers;
        };
        QTest::newRow("left") << int(Qt::Key_Left)
                              << QList<int>{11} + counted(0, 10) + QList<int>{23} +
                                     counted(12, 22) + QList<int>{34} + counted(24, 33) +
                                     QList<int>{46} + counted(35, 45) + QList<int>{54} +
                                     counted(47, 53);
        QTest::newRow("right") << int(Qt::Key_Right)
                               << counted(1, 11) + QList<int>{0} + counted(13, 23) +
                                      QList<int>{12} + counted(25, 34) + QList<int>{24} +
                                      counted(36, 46) + QList<int>{35} + counted(48, 54) +
                                      QList<int>{47};
        QTest::newRow("up") << int(Qt::Key_Up)
                            << counted(0, 11) + counted(0, 11) + counted(12, 19) +
                                   QList<int>{21, 22, 23, 24, 25, 26, 27, 28, 29, 30, 31} +
                                   QList<int>{31, 32, 33, 34, 35, 37, 38, 40, 41, 43, 44, 45};
        QTest::newRow("down") << int(Qt::Key_Down)
                              << counted(12, 31) + QList<int>{31, 32, 33, 34} + counted(35, 42) +
                                     QList<int>{44, 45, 46, 47, 47, 48, 49, 49, 50, 51, 51, 52} +
                                     QList<int>{53, 54, 54} + counted(47, 54);
    }

    void moves()
    {
        QFETCH(int, arrow);
        QFETCH(QList<int>, expected);
        QCOMPARE(expected.size(), kKeyCount);
        for (int i = 0; i < kKeyCount; ++i)
            QCOMPARE(movedKeyFocus(i, arrow), expected.at(i));
        QCOMPARE(movedKeyFocus(-1, arrow), 0);
    }

    void everyCharacterCanBeTyped()
    {
        const QSet<QString> texts = everyText();
        QString wanted = QStringLiteral("0123456789+ ,._@*:;?!#$%&`()-/<=>[]\\^'{}|~\"");
        for (char letter = 'a'; letter <= 'z'; ++letter)
            wanted += QLatin1Char(letter) + QString(QLatin1Char(letter)).toUpper();
        wanted += QStringLiteral(u"äöüßéèàçñøåÄÖÜÉ");
        for (QChar character : wanted)
            QVERIFY2(texts.contains(character), qPrintable(QString(character)));
        for (const char *text : {":)", ":(", ":D", "www.", ".com"})
            QVERIFY2(texts.contains(QString::fromLatin1(text)), text);
    }
};

QTEST_APPLESS_MAIN(tst_KeyboardLayout)
#include "tst_keyboardlayout.moc"
