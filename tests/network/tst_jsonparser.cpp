#include "network/jsonparser.h"
#include "support/logcapture.h"

#include <QRandomGenerator>
#include <QtScript>
#include <QtTest>

#include <cmath>

// The engine itself leaks a little.
extern "C" const char *__lsan_default_suppressions();
const char *__lsan_default_suppressions()
{
    return "leak:libQt5Script";
}

// A script engine's own parser is the judge: of what is accepted, and of the tree.
namespace {

struct Outcome
{
    bool isAccepted = false;
    QVariant tree;
};

QVariant engineTree(const QScriptValue &value);

QVariantList engineList(const QScriptValue &array)
{
    QVariantList list;
    for (QScriptValueIterator it(array); it.hasNext();) {
        it.next();
        if (it.value().isArray())
            list += engineList(it.value());
        else if (it.name() != "length")
            list.append(engineTree(it.value()));
    }
    return list;
}

JsonObject engineHash(const QScriptValue &object)
{
    JsonObject hash;
    for (QScriptValueIterator it(object); it.hasNext();) {
        it.next();
        hash.insert(it.name(), engineTree(it.value()));
    }
    return hash;
}

QVariant engineTree(const QScriptValue &value)
{
    if (value.isArray())
        return engineList(value);
    if (value.isObject())
        return engineHash(value);
    return value.isNumber() ? QVariant(value.toNumber()) : value.toVariant();
}

Outcome judge(const QString &text)
{
    static QScriptEngine engine;
    static QScriptValue function = engine.evaluate("JSON.parse");
    engine.clearExceptions();
    const QScriptValue value = function.call(QScriptValue(), QScriptValueList{text});
    if (engine.hasUncaughtException())
        return {};
    return {true, value.isObject() ? engineHash(value) : JsonObject()};
}

template <typename Text>
Outcome parse(const Text &text)
{
    LogCapture log;
    const JsonObject tree = JsonParser::parse(text);
    return {LogCapture::contains("JsonParser::parse engine.evaluate OK."), tree};
}

bool isSame(const QVariant &a, const QVariant &b)
{
    if (a.type() != b.type())
        return false;
    if (a.type() == QVariant::Double)
        return a.toDouble() == b.toDouble() &&
               std::signbit(a.toDouble()) == std::signbit(b.toDouble());
    if (a.type() == QVariant::List) {
        const QVariantList first = a.toList(), second = b.toList();
        return std::equal(first.begin(), first.end(), second.begin(), second.end(), isSame);
    }
    if (a.type() != QVariant::Hash)
        return a == b;
    const JsonObject first = a.toHash(), second = b.toHash();
    bool same = first.size() == second.size();
    for (auto it = first.begin(); same && it != first.end(); ++it)
        same = second.contains(it.key()) && isSame(it.value(), second.value(it.key()));
    return same;
}

bool agrees(const QString &text)
{
    const Outcome expected = judge(text);
    const Outcome actual = parse(text);
    bool same = actual.isAccepted == expected.isAccepted && isSame(actual.tree, expected.tree);
    if (!expected.isAccepted)
        same = !actual.isAccepted && actual.tree.toHash().isEmpty();
    if (same && text.isValidUtf16() && !text.startsWith(QChar::ByteOrderMark)) {
        const Outcome bytes = parse(text.toUtf8());
        same = bytes.isAccepted == actual.isAccepted && isSame(bytes.tree, actual.tree);
    }
    return same;
}

// The texts of json-texts.txt, one a line, and those that a line of plain characters cannot hold.
const QStringList &tellingTexts()
{
    static const QStringList texts = [] {
        QFile file(QFINDTESTDATA("json-texts.txt"));
        if (!file.open(QIODevice::ReadOnly))
            qFatal("json-texts.txt is missing");
        QStringList list = QString::fromUtf8(file.readAll()).split('\n'); // the last one is empty
        for (const char *text :
             {"", " ", " { } ", " [1]\t\r\n ", "[1]\n#", "[0,-0 ,-0\n]", "[\xEF\xBC\x91]",
              "[\"a\nb\"]", "[\"a\x01\"]", "[\"\x1f\"]", "[\"\x7f\"]", "[\"\xE2\x80\xA8\xC2\xA0\"]",
              "[\"\xEF\xBB\xBF\"]", "{\"\xEF\xBB\xBFk\":\"\xEF\xBB\xBF\xEF\xBB\xBFv\"}",
              "\xEF\xBB\xBF[1]", "[1]\xC2\xA0", "\xE2\x80\x83[1]", "[\"\xF0\x9F\x98\x80\"]"})
            list << QString::fromUtf8(text);
        return list;
    }();
    return texts;
}

// One random change: a character dropped, doubled, replaced, or a piece moved.
QString mutated(QString text, QRandomGenerator &random)
{
    static const QString alphabet =
        QString::fromUtf8("{}[]:,\"\\/ \n0123456789-+.eEtfnulrsaud\xC3\xA9") + QChar(0) +
        QChar(0xD83D) + QChar(0xDE00) + QChar(0xFEFF) + QChar(0x1F);
    const int at = int(random.bounded(quint32(text.size() + 1)));
    const QChar letter = alphabet.at(int(random.bounded(quint32(alphabet.size()))));
    switch (random.bounded(4)) {
    case 0:
        return text.remove(at, 1);
    case 1:
        return text.insert(at, letter);
    case 2:
        return text.replace(at, 1, letter);
    default:
        return text.insert(at, text.mid(int(random.bounded(quint32(text.size() + 1))), 5));
    }
}

} // namespace

class TestJsonParser : public QObject
{
    Q_OBJECT

private slots:
    void agreesWithTheEngine()
    {
        for (const QString &text : tellingTexts())
            QVERIFY2(agrees(text), qPrintable(text));
        QVERIFY(agrees(QString("[\"\\\\\\") + QChar(0xD83D) + "\"]"));
        QVERIFY(agrees(QString("[\"") + QChar(0xDE00) + "\",-0]"));
    }

    void mutationsAgreeWithTheEngine()
    {
        QRandomGenerator random(20201);
        for (int round = 0; round < 20000; ++round) {
            QString text = tellingTexts().at(int(random.bounded(quint32(tellingTexts().size()))));
            for (quint32 change = random.bounded(3) + 1; change > 0; --change)
                text = mutated(text, random);
            // Here the engine is laxer than the language.
            if (!text.contains('\t'))
                QVERIFY2(agrees(text), text.toUtf8().toPercentEncoding("[]{}:,\"\\ ").constData());
        }
    }

    void refusesWhatTheLanguageRefuses_data()
    {
        QTest::addColumn<QByteArray>("text");
        QTest::newRow("tab in a string") << QByteArray("[\"a\tb\"]");
        QTest::newRow("vertical tab") << QByteArray("\v[1]");
        QTest::newRow("form feed") << QByteArray("[1]\f");
        QTest::newRow("byte-order mark") << QByteArray("\xEF\xBB\xBF{\"a\":1}");
        QTest::newRow("zero byte") << QByteArray("{\"a\":1}\0", 8);
        QTest::newRow("web page") << QByteArray("<!DOCTYPE html><html></html>");
        QTest::newRow("UTF-16") << QByteArray("{\0\"\0a\0\"\0:\0001\0}\0", 14);
    }

    void refusesWhatTheLanguageRefuses()
    {
        QFETCH(QByteArray, text);
        QVERIFY(!parse(text).isAccepted);
        QVERIFY(JsonParser::parse(text).isEmpty());
    }

    void repairsBytesThatAreNoText()
    {
        const JsonObject tree = JsonParser::parse(QByteArray("{\"a\":\"x\xFFy\",\"b\":\"\xC3\"}"));
        QCOMPARE(tree.value("a").toString(), QString("x") + QChar(0xFFFD) + "y");
        QCOMPARE(tree.value("b").toString(), QString(QChar(0xFFFD)));
    }

    void boundsTheDepth()
    {
        for (const QByteArray &open :
             {QByteArray("["), QByteArray("{\"a\":"), QByteArray("[[],{\"a\":")}) {
            const int levels = open.count('[') + open.count('{') - open.count(']');
            const QByteArray close = open.startsWith("[[")  ? "}]"
                                     : open.startsWith('[') ? "]"
                                                            : "}";
            for (const char *core : {"1", "[]", "{}", "[-0]", "[\"\\ud83d\"]"}) {
                const int inner = core[0] == '1' ? 0 : 1;
                const int deepest = (1000 - inner) / levels;
                const auto nested = [&](int n) {
                    return open.repeated(n) + core + close.repeated(n);
                };
                QVERIFY(parse(nested(deepest)).isAccepted);
                QVERIFY(!parse(nested(deepest + 1)).isAccepted);
            }
        }
        QVERIFY(JsonParser::parse(QByteArray("[").repeated(1000000)).isEmpty());
    }

    void arraysAreFlattened()
    {
        const JsonObject top = JsonParser::parse(QString("[[1,[2]],\"x\"]"));
        QCOMPARE(top.value("0").toList(), QVariantList({1.0, 2.0}));
        QCOMPARE(top.value("length"), QVariant(2.0));
    }

    void looksUpValues()
    {
        const JsonObject tree = JsonParser::parse(
            QString("{\"s\":\"t\",\"n\":null,\"b\":true,\"o\":{},\"numbers\":0,\"i\":100000,"
                    "\"id\":5613423423423423,\"f\":0.1,\"m\":-2.5,\"h\":1e21,\"z\":-0}"));
        QVERIFY(!JsonParser::value(tree, "absent").isValid());
        const QHash<QString, QString> texts = {{"s", "t"},
                                               {"n", ""},
                                               {"b", "true"},
                                               {"o", ""},
                                               {"absent", ""},
                                               {"i", "100000"},
                                               {"f", "0.1"},
                                               {"m", "-2.5"},
                                               {"h", "1e+21"},
                                               {"z", "0"},
                                               {"id", "5613423423423423"}};
        for (auto it = texts.begin(); it != texts.end(); ++it)
            QCOMPARE(JsonParser::string(tree, it.key()), it.value());
    }
};

QTEST_GUILESS_MAIN(TestJsonParser)
#include "tst_jsonparser.moc"
