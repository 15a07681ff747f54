#include "http/form.h"

#include "base/texts.h"

#include <algorithm>

Form::Form(const std::string &body)
{
    std::size_t start = 0;
    while (start < body.size()) {
        const std::size_t end = std::min(body.find('&', start), body.size());
        std::string part = body.substr(start, end - start);
        std::replace(part.begin(), part.end(), '+', ' ');
        const std::size_t equals = std::min(part.find('='), part.size());
        const std::string name = percentDecoded(part.substr(0, equals));
        mFields.emplace(name, equals < part.size() ? percentDecoded(part.substr(equals + 1)) : "");
        start = end + 1;
    }
}

std::string Form::value(const std::string &name) const
{
    const auto found = mFields.find(name);
    return found == mFields.end() ? std::string() : found->second;
}
