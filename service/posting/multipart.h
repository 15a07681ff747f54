#pragma once

#include <functional>
#include <string>
#include <string_view>

// Takes a body of several parts apart while it arrives, as in "multipart/related; boundary=B".
// Lines may end in "\n" or "\r\n".
class MultipartReader
{
public:
    // Called for each part in turn: once with its type, in small letters and without parameters,
    // then for its content, piece by piece.
    using Begin = std::function<void(const std::string &contentType)>;
    using Content = std::function<void(std::string_view bytes)>;

    MultipartReader(const std::string &boundary, Begin begin, Content content);

    void feed(std::string_view bytes);
    // The last boundary has come: nothing has been cut off.
    bool isWhole() const { return mState == State::Behind; }

private:
    enum class State { Before, Head, Content, Behind, Broken };
    enum class Line { Unknown, Content, Delimiter, Last };

    bool step();
    bool readHead();
    bool readContent();
    Line lineAt(std::size_t place) const;
    void give(std::size_t bytes);

    const std::string mDelimiter; // with the line end before it
    const Begin mBegin;
    const Content mContent;
    State mState = State::Before;
    std::string mType;
    int mParts = 0;
    std::string mBytes = "\n"; // not yet dealt with
    bool mHasLineEnd = true;   // the first of them is no content
};

// Empty when the type is another one or names no boundary. Some clients write more behind the
// boundary, in the same line: it ends at the first blank or semicolon, unless it is quoted.
std::string boundaryOf(const std::string &contentType);
