#pragma once

#include <QString>

// Finds the proxy of the device: the INI file's, else the first line of the file that the device's
// menu writes. What was found is kept for the run; the menu's file is tried again at every call
// until it holds an address.
class ProxyAddress
{
public:
    // "host:port", or a null text for none.
    static QString find();

    // For tests: forget what was found, and look into another file.
    static void reset();
    static void setFile(const QString &path);

private:
    static bool readConfiguration();
    static void readFile();

    static QString mFile;
    static bool mIsConfigurationRead;
    static QString mConfiguredAddress;
    static bool mIsFileRead;
    static QString mFileAddress;
};
