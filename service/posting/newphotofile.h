#pragma once

#include <string>
#include <string_view>

// A photo on its way into a folder. Nobody sees it until publish() gives it its name; unless keep()
// is called it goes again with this object. Where the file system can, it has no name before, so
// that nothing stays behind even when the process is killed; elsewhere it has a hidden one.
class NewPhotoFile
{
public:
    // What went wrong first.
    enum class Problem { None, NoRoom, NoLeave, Other };

    explicit NewPhotoFile(std::string folder);
    ~NewPhotoFile();
    NewPhotoFile(const NewPhotoFile &) = delete;
    NewPhotoFile &operator=(const NewPhotoFile &) = delete;

    // Writes further bytes; after a problem they are dropped.
    void write(std::string_view bytes);
    // Brings what was written down to the disk.
    bool finish();
    // Gives the file a name made from the title and the extension (as ".jpg"), with a number when
    // others have that name; never in the place of another file.
    bool publish(const std::string &title, const std::string &extension);
    void keep() { mKept = true; }

    Problem problem() const { return mProblem; }
    // Where the file can be read, before and after it has its name.
    std::string path() const;
    const std::string &folder() const { return mFolder; }
    const std::string &name() const { return mName; }

private:
    void open();
    bool rename(const std::string &name);
    bool fail();

    const std::string mFolder;
    std::string mName; // empty while it has none
    int mFile = -1;
    Problem mProblem = Problem::None;
    bool mKept = false;
};

// A title as the name of a file in any file system, without an extension.
std::string fileNameFor(const std::string &title);
