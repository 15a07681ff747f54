// The slide show on the screen, stepped by the keyboard's arrows: slidescreen FILE...

#include "ui/slidescene.h"
#include "ui/slidesetting.h"

int main(int argc, char **argv)
{
    SlideScene scene(argc, argv, "BlurredFill=true\n");
    QStringList files;
    for (int i = 1; i < argc; ++i)
        files << QString::fromLocal8Bit(argv[i]);
    if (files.isEmpty())
        return 1;
    scene.serveFiles(files.size(), files);
    scene.open(0);
    return QApplication::exec();
}
