#include "network/jsonparser.h"
#include "support/logcapture.h"

#include <QtTest>

#include <cmath>

namespace {

QString quoted(const QString &text)
{
    QString line;
    for (const QChar letter : text) {
        if (letter >= ' ' && letter <= '~')
            line += letter;
        else
            line += QStringLiteral("\\%1").arg(letter.unicode(), 4, 16, QLatin1Char('0'));
    }
    return '"' + line + '"';
}

// A tree as a line of plain characters, members in order.
QString written(const QVariant &value)
{
    if (value.type() == QVariant::Hash) {
        QStringList members;
        const JsonObject object = value.toHash();
        for (auto it = object.begin(); it != object.end(); ++it)
            members << quoted(it.key()) + ':' + written(it.value());
        members.sort();
        return '{' + members.join(',') + '}';
    }
    if (value.type() == QVariant::List) {
        QStringList items;
        for (const QVariant &item : value.toList())
            items << written(item);
        return '[' + items.join(',') + ']';
    }
    if (value.type() == QVariant::Double)
        return (value.toDouble() == 0 && std::signbit(value.toDouble()) ? "-" : "") +
               QString::number(value.toDouble(), 'g', 17);
    if (value.type() == QVariant::String)
        return quoted(value.toString());
    return value.type() == QVariant::Bool ? value.toString() : QString(value.typeName());
}

template <typename Text>
QString outcomeOf(const Text &text)
{
    LogCapture log;
    const JsonObject tree = JsonParser::parse(text);
    if (LogCapture::contains("JsonParser::parse engine.evaluate OK."))
        return written(tree);
    return tree.isEmpty() ? "refused" : "refused, but not empty";
}

} // namespace

class TestJsonParser : public QObject
{
    Q_OBJECT

private slots:
    // Each line of json-texts.txt: a text, percent-encoded where it must be, and the tree that a
    // script engine's own parser has made of it, or nothing if that refused it.
    void agreesWithAScriptEngine()
    {
        QFile file(QFINDTESTDATA("json-texts.txt"));
        QVERIFY(file.open(QIODevice::ReadOnly));
        while (!file.atEnd()) {
            const QList<QByteArray> parts = file.readLine().chopped(1).split('\t');
            const QByteArray text = QByteArray::fromPercentEncoding(parts.first());
            const QString expected = parts.value(1, "refused");
            QCOMPARE(parts.first() + ' ' + outcomeOf(text), parts.first() + ' ' + expected);
            if (!text.startsWith("\xEF\xBB\xBF"))
                QCOMPARE(parts.first() + ' ' + outcomeOf(QString::fromUtf8(text, text.size())),
                         parts.first() + ' ' + expected);
        }
        QCOMPARE(outcomeOf(QString("[\"\\\\\\") + QChar(0xD83D) + "\"]"), QString("refused"));
        QCOMPARE(outcomeOf(QString("[\"") + QChar(0xDE00) + "\",-0]"),
                 QString("{\"0\":\"\\de00\",\"1\":-0,\"length\":2}"));
    }

    void looksUpValuesAndRepairsBytesThatAreNoText()
    {
        const JsonObject broken =
            JsonParser::parse(QByteArray("{\"a\":\"x\xFFy\",\"b\":\"\xC3\"}"));
        QCOMPARE(broken.value("a").toString(), QString("x") + QChar(0xFFFD) + "y");
        QCOMPARE(broken.value("b").toString(), QString(QChar(0xFFFD)));
        const JsonObject tree = JsonParser::parse(
            QString("{\"s\":\"t\",\"n\":null,\"b\":true,\"o\":{},\"numbers\":0,\"i\":100000,"
                    "\"id\":5613423423423423,\"f\":0.1,\"m\":-2.5,\"h\":1e21,\"z\":-0}"));
        QVERIFY(!JsonParser::value(tree, "absent").isValid());
        QStringList texts;
        for (const char *key : {"s", "n", "b", "o", "absent", "i", "id", "f", "m", "h", "z"})
            texts << JsonParser::string(tree, key);
        QCOMPARE(texts.join(' '), "t  true   100000 5613423423423423 0.1 -2.5 1e+21 0");
    }

    void boundsTheDepth()
    {
        const QPair<QByteArray, QByteArray> rows[] = {{"[", "]"}, {"{\"a\":", "}"}};
        for (const auto &[open, close] : rows) {
            for (const QByteArray core : {"1", "[]", "{}", "[-0]", "[\"\\ud83d\"]"}) {
                const int deepest = core == "1" ? 1000 : 999;
                QVERIFY(outcomeOf(open.repeated(deepest) + core + close.repeated(deepest)) !=
                        "refused");
                QCOMPARE(outcomeOf(open.repeated(deepest + 1) + core + close.repeated(deepest + 1)),
                         "refused");
            }
        }
        QVERIFY(JsonParser::parse(QByteArray("[").repeated(1000000)).isEmpty());
    }
};

QTEST_GUILESS_MAIN(TestJsonParser)
#include "tst_jsonparser.moc"
