#include "network/jsonnode.h"

#include <cmath>

namespace {

class Reader
{
public:
    explicit Reader(const QString &text)
        : mAt(text.constData())
        , mEnd(mAt + text.size())
    {
    }

    bool document(JsonNode &node)
    {
        if (!value(node))
            return false;
        skipBlanks();
        return mAt == mEnd;
    }

private:
    static bool isDigit(ushort c) { return c >= '0' && c <= '9'; }

    ushort peek() const { return mAt < mEnd ? mAt->unicode() : 0; }
    bool accept(char c);
    bool acceptAfterBlanks(char c);
    bool word(const char *letters);
    bool digits();
    void skipBlanks();

    bool value(JsonNode &node);
    bool container(JsonNode &node, char close);
    bool member(JsonNode &node);
    bool scalar(QVariant &out);
    bool number(QVariant &out);
    bool string(QString &out);
    bool escape(QString &out);
    bool codeUnit(QString &out);

    const QChar *mAt;
    const QChar *const mEnd;
    int mDepth = 0;
};

bool Reader::accept(char c)
{
    if (mAt == mEnd || *mAt != QLatin1Char(c))
        return false;
    ++mAt;
    return true;
}

bool Reader::acceptAfterBlanks(char c)
{
    skipBlanks();
    return accept(c);
}

bool Reader::word(const char *letters)
{
    while (*letters) {
        if (!accept(*letters++))
            return false;
    }
    return true;
}

bool Reader::digits()
{
    const QChar *start = mAt;
    while (isDigit(peek()))
        ++mAt;
    return mAt > start;
}

void Reader::skipBlanks()
{
    while (peek() == ' ' || peek() == '\t' || peek() == '\n' || peek() == '\r')
        ++mAt;
}

bool Reader::value(JsonNode &node)
{
    skipBlanks();
    if (accept('[')) {
        node.kind = JsonNode::Array;
        return container(node, ']');
    }
    if (accept('{')) {
        node.kind = JsonNode::Object;
        return container(node, '}');
    }
    return scalar(node.scalar);
}

bool Reader::container(JsonNode &node, char close)
{
    if (++mDepth > deepestJson)
        return false;
    bool isComplete = acceptAfterBlanks(close);
    while (!isComplete) {
        if (!member(node))
            return false;
        isComplete = acceptAfterBlanks(close);
        if (!isComplete && !accept(','))
            return false;
    }
    --mDepth;
    return true;
}

bool Reader::member(JsonNode &node)
{
    if (node.kind == JsonNode::Object) {
        skipBlanks();
        node.keys.emplace_back();
        if (!string(node.keys.back()) || !acceptAfterBlanks(':'))
            return false;
    }
    node.items.emplace_back();
    return value(node.items.back());
}

bool Reader::scalar(QVariant &out)
{
    switch (peek()) {
    case '"': {
        QString text;
        const bool isRead = string(text);
        out = text;
        return isRead;
    }
    case 't':
        out = true;
        return word("true");
    case 'f':
        out = false;
        return word("false");
    case 'n':
        return word("null");
    default:
        return number(out);
    }
}

bool Reader::number(QVariant &out)
{
    const QChar *start = mAt;
    accept('-');
    if (!accept('0') && !digits())
        return false;
    if (accept('.') && !digits())
        return false;
    if (accept('e') || accept('E')) {
        if (!accept('-'))
            accept('+');
        if (!digits())
            return false;
    }
    // Infinity or zero when the number is out of range; the conversion forgets the sign of zero.
    const double result = QString(start, int(mAt - start)).toLatin1().toDouble();
    out = *start == QLatin1Char('-') ? -std::fabs(result) : result;
    return true;
}

bool Reader::string(QString &out)
{
    if (!accept('"'))
        return false;
    out = QLatin1String("");
    while (mAt < mEnd && peek() >= ' ') {
        if (accept('"'))
            return true;
        if (accept('\\')) {
            if (!escape(out))
                return false;
            continue;
        }
        out += *mAt++;
    }
    return false;
}

bool Reader::escape(QString &out)
{
    static const QString letters = QStringLiteral("\"\\/bfnrt");
    static const QString meanings = QStringLiteral("\"\\/\b\f\n\r\t");
    if (mAt == mEnd)
        return false;
    const QChar letter = *mAt++;
    if (letter == QLatin1Char('u'))
        return codeUnit(out);
    const int index = letters.indexOf(letter);
    if (index < 0)
        return false;
    out += meanings.at(index);
    return true;
}

bool Reader::codeUnit(QString &out)
{
    ushort unit = 0;
    for (int i = 0; i < 4; ++i) {
        const ushort c = peek();
        const ushort lower = c | 0x20;
        const bool isLetter = lower >= 'a' && lower <= 'f' && c < 0x80;
        if (!isDigit(c) && !isLetter)
            return false;
        unit = ushort(unit * 16 + (isLetter ? lower - 'a' + 10 : c - '0'));
        ++mAt;
    }
    out += QChar(unit);
    return true;
}

} // namespace

std::optional<JsonNode> readJson(const QString &text)
{
    JsonNode node;
    if (!Reader(text).document(node))
        return std::nullopt;
    return node;
}
