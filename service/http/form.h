#pragma once

#include <map>
#include <string>

// The fields of a posted form, or of a query.
class Form
{
public:
    // Reads the text whatever content type it came with: some clients send none. A name that comes
    // twice keeps its first value.
    explicit Form(const std::string &body);

    // Empty when there is no such field.
    std::string value(const std::string &name) const;

private:
    std::map<std::string, std::string> mFields;
};
