#pragma once

#include "base/log.h"
#include "network/jsonparser.h"

#include <QLoggingCategory>

// The rules by which parsed values become variants, for any source of values. A source has
//   bool isArray(v), bool isObject(v), QVariant scalar(v),
//   void eachItem(v, f(item)), void eachMember(v, f(key, value)).
template <typename Source>
class JsonWalker
{
public:
    using Value = typename Source::Value;

    explicit JsonWalker(Source &source)
        : mSource(source)
    {
    }

    JsonObject top(const Value &value)
    {
        if (!mSource.isArray(value))
            return object(value);
        JsonObject result;
        int count = 0;
        mSource.eachItem(value, [&](const Value &item) {
            result.insert(QString::number(count++), variant(item));
        });
        result.insert(QStringLiteral("length"), double(count));
        return result;
    }

private:
    QVariant variant(const Value &value)
    {
        if (mSource.isArray(value)) {
            QVariantList items;
            appendItems(items, value);
            return items;
        }
        return mSource.isObject(value) ? QVariant(object(value)) : mSource.scalar(value);
    }

    // Empty for a scalar.
    JsonObject object(const Value &value)
    {
        JsonObject result;
        if (mSource.isObject(value)) {
            mSource.eachMember(value, [&](const QString &key, const Value &member) {
                result.insert(key, variant(member));
            });
        }
        return result;
    }

    // An array inside an array is flattened into it.
    void appendItems(QVariantList &items, const Value &array)
    {
        const int sizeBefore = items.size();
        mSource.eachItem(array, [&](const Value &item) {
            if (mSource.isArray(item))
                appendItems(items, item);
            else
                items.append(variant(item));
        });
        logSkippedLength();
        if (items.size() == sizeBefore)
            logLine("ERROR : canver Array fail, the QVariantList is Empty !");
    }

    // A feed has thousands of arrays: the line is made once and goes straight to the handler.
    static void logSkippedLength()
    {
        static const QString line = QStringLiteral("-Skip! This is a QScriptValue lenght");
        const QLoggingCategory *category = QLoggingCategory::defaultCategory();
        if (category->isDebugEnabled())
            qt_message_output(QtDebugMsg, {nullptr, 0, nullptr, category->categoryName()}, line);
    }

    Source &mSource;
};
