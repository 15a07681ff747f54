#pragma once

#include <QString>
#include <QVariant>

#include <optional>
#include <vector>

constexpr int deepestJson = 1000; // levels of arrays and objects

// A value of a JSON text.
struct JsonNode
{
    enum Kind { Scalar, Array, Object };

    Kind kind = Scalar;
    QVariant scalar;             // invalid for null
    std::vector<JsonNode> items; // of an array, or the values of an object's members
    std::vector<QString> keys;   // of an object, one for each item
};

// Reads texts to the letter of the language's grammar, as a script engine does: in UTF-16, where
// half a surrogate pair is a character and a number may be too large. Nothing for a malformed text.
std::optional<JsonNode> readJson(const QString &text);
