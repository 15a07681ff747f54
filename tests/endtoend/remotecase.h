#pragma once

#include "endtoend/albumservice.h"
#include "endtoend/television.h"
#include "ui/detailaction.h"

#include <QTest>

#include <memory>

// What the tests with somebody in front of the whole program and a real album service share: three
// people with photos, each of one colour, and ways around the screens by the remote.
class RemoteCase : public QObject
{
public:
    // The main function of such a test. TEST_SCALE in the environment scales the interface as
    // "Layout/Scale" does: 1.5 is the program on a screen of 1920 x 1080.
    static int run(RemoteCase &test, int argc, char **argv);

protected:
    static const QString anna, ben, carl; // addresses

    // So many photos, "<name> 1" and so on, in a folder as "anna/Sea".
    void addPhotos(const QString &folder, const QString &name, int count);
    void addPeople();
    // The service with the photos added, and a television; and both off.
    void switchOn();
    void switchOff();
    // Anna, with the service at that origin; ends when the featured photos are on the screen.
    void signIn(const QString &origin);
    // Selects an entry of the menu.
    void enter(int entry);
    // Moves right, over as many pages as it takes, to the cell whose caption begins like that.
    void walkTo(const QString &caption);
    // Types on the keyboard that is shown, and presses its Enter.
    void type(const QString &text);
    // Runs an action of the photo screen, wherever the mark is there.
    void runOnPhoto(DetailAction action);
    // The cells are on the screen, with their pictures, and the focus is at this position.
    bool isListed(const QString &position, int cells) const;

    AlbumService mService;
    QHash<QString, QColor> mColours; // by caption
    std::unique_ptr<Television> mTv;
};
