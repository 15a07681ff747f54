#pragma once

#include <httplib.h>

#include <string>

// Answers with the file's content, read from the disk piece by piece while it is sent: however
// large it is and however many fetch it, it takes no memory. False, and no answer, when it cannot
// be read. A file that becomes shorter meanwhile ends the connection.
bool answerWithFile(httplib::Response &response, const std::string &path,
                    const std::string &mimeType);
