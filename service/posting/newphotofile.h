#pragma once

#include <string>
#include <string_view>

// A photo on its way into a folder. It lies there under a hidden name, which nobody shows, until
// publish() gives it its own; unless keep() is called it goes again with this object.
class NewPhotoFile
{
public:
    explicit NewPhotoFile(std::string folder);
    ~NewPhotoFile();
    NewPhotoFile(const NewPhotoFile &) = delete;
    NewPhotoFile &operator=(const NewPhotoFile &) = delete;

    // Writes all bytes down to the disk; false when there is no room or no leave.
    bool write(std::string_view bytes);
    // Gives the file a name made from the title and the extension (as ".jpg"), with a number when
    // others have that name; never in the place of another file.
    bool publish(const std::string &title, const std::string &extension);
    void keep() { mKept = true; }

    std::string path() const { return mFolder + "/" + mName; }
    const std::string &folder() const { return mFolder; }
    const std::string &name() const { return mName; }

private:
    bool rename(const std::string &name);

    const std::string mFolder;
    std::string mName;
    bool mKept = false;
};

// A title as the name of a file in any file system, without an extension.
std::string fileNameFor(const std::string &title);
