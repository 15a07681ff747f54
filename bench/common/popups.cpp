// The on-screen keyboard's focus moves, from the key to the repainted keys, against the time of a
// frame; and a dialog with a text of 10,000 characters against one with a line.

#include "common/ui/qkeyboard.h"
#include "common/ui/qpopupdialog.h"
#include "network/systemconfig.h"
#include "res/resources.h"
#include "support/bench.h"

#include <QApplication>
#include <QKeyEvent>

namespace {

constexpr int kRounds = 31;
constexpr int kMoves = 1000;
constexpr double kFrame = 1.0 / 60;

void pressRight(QWidget *target)
{
    QKeyEvent press(QEvent::KeyPress, Qt::Key_Right, Qt::NoModifier);
    QApplication::sendEvent(target, &press);
    QCoreApplication::processEvents();
}

void focusMoves()
{
    QKeyBoard keyboard;
    keyboard.show();
    QCoreApplication::processEvents();
    std::vector<double> moves;
    for (int i = 0; i < kMoves; ++i)
        moves.push_back(bench::seconds([&keyboard] { pressRight(&keyboard); }));
    const double move = bench::median(moves);
    bench::row("keyboard focus move, share of a frame", move / kFrame, 1,
               std::to_string(int(move * 1e6)) + " microseconds");
}

void dialogs()
{
    QWidget screen;
    screen.setFixedSize(1280, 720);
    screen.show();
    const auto shown = [&screen](const QString &text) {
        return [&screen, text] {
            QPopupDialog dialog(&screen);
            dialog.initDialog(text, text, {text});
            dialog.show();
            QCoreApplication::processEvents();
        };
    };
    QString words;
    while (words.size() < 10000)
        words += QStringLiteral(u"many words, viele Wörter ");
    const auto result = bench::compare(kRounds, shown(words), shown(QStringLiteral("Close")));
    bench::row("dialog of 10,000 characters against one line", result.ratio, 0,
               bench::milliseconds(result));
}

} // namespace

int main(int argc, char *argv[])
{
    qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication application(argc, argv);
    initResources();
    SystemConfig::mScreen_Width = 1280;
    SystemConfig::mScreen_Height = 720;
    focusMoves();
    dialogs();
    return 0;
}
