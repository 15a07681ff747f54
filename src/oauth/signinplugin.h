#pragma once

#include <QString>

#include <memory>

class SignInView;

// Loads the web view's plug-in when it is first needed; it stays loaded. The first time blocks
// until the browser is in memory.
class SignInPlugin
{
public:
    // Null when the plug-in is missing, damaged or of another version; the log says why.
    static std::unique_ptr<SignInView> createView();

    // For tests: another file; an empty name stands for the installed one.
    static void setFile(const QString &path);

private:
    static QString mFile;
};
