// Drives the dialogs, pop-up forms and the on-screen keyboard by the remote's keys and saves what
// they look like, to be looked at: orvala-gallery FOLDER [SCALE]. The pictures have the size of the
// layout, 1280 x 720, times the scale (1.5 is a 1080p screen).

#include "accountmanager/accountmanagerhelper.h"
#include "common/keyrobot.h"
#include "common/longtexts.h"
#include "common/ui/qconfirm.h"
#include "common/ui/qkeyboard.h"
#include "common/ui/qpopupdialog.h"
#include "common/ui/qpopupform.h"
#include "common/ui/qtoastwidget.h"
#include "common/ui/remotekeys.h"
#include "common/ui/scale.h"
#include "network/systemconfig.h"
#include "paths.h"
#include "res/resources.h"

#include <QApplication>
#include <QDir>
#include <QFontDatabase>
#include <QTemporaryFile>
#include <QTextStream>

#include <functional>

namespace {

QString outputFolder;

// A screen for pop-ups to lie over, with the focus on it.
class Stage : public QWidget
{
public:
    Stage()
    {
        setFixedSize(SystemConfig::mScreen_Width, SystemConfig::mScreen_Height);
        QPalette colours = palette();
        colours.setBrush(QPalette::Window,
                         QPixmap(QStringLiteral(":/res/orvala_background.png"))
                             .scaled(size(), Qt::IgnoreAspectRatio, Qt::SmoothTransformation));
        setPalette(colours);
        setFocusPolicy(Qt::StrongFocus);
        show();
        setFocus();
    }

    void save(const QString &name)
    {
        QCoreApplication::processEvents();
        grab().save(outputFolder + QLatin1Char('/') + name + QStringLiteral(".png"));
    }
};

void dialog(const QString &name, const QString &title, const QString &message,
            const QList<QString> &buttons, const QList<int> &keys = {})
{
    Stage stage;
    QPopupDialog dialog(&stage);
    dialog.initDialog(title, message, buttons);
    dialog.show();
    for (int key : keys)
        pressKey(&dialog, key);
    stage.save(name);
}

void confirm(const QString &name, int type, const QString &text, const QList<int> &keys = {})
{
    Stage stage;
    QConfirm question(&stage);
    question.init(type, text);
    question.show();
    for (int key : keys)
        pressKey(&question, key);
    stage.save(name);
}

void input(const QString &name, int kind, bool isPassword,
           const std::function<void(KeyRobot &)> &type)
{
    Stage stage;
    QPopUpForm form(&stage);
    form.initForm(kind);
    form.setInputMode(isPassword);
    form.show();
    KeyRobot robot(&form);
    type(robot);
    stage.save(name);
}

void dialogs()
{
    dialog("dialog-one", "Error", "The network cable was plugged out, please check it!", {"Close"});
    dialog("dialog-two", "Notification",
           "The network cable was plugged in, please wait before network connection restores!",
           {"OK", "Cancel"}, {DEVICE_RIGHT_KEY});
    dialog("dialog-long", longText("A title that has no end "), longText("Words and more words. "),
           {"A rather long button", "R & D"});
    dialog("dialog-word", "One word", QString(10000, QLatin1Char('W')), {"Close"});
    dialog("dialog-rtl", hebrew(), longText(hebrew()), {hebrew(), "No"}, {DEVICE_RIGHT_KEY});
    dialog("dialog-emoji", emoji(), longText(emoji()), {emoji(), "OK"});
    confirm("confirm-tag", QConfirm::DeleteTag, "Harbour &amp; ships");
    confirm("confirm-tag-long", QConfirm::DeleteTag, longText("seaside "), {DEVICE_RIGHT_KEY});
    confirm("confirm-sign-out", QConfirm::SignOut, {}, {DEVICE_RIGHT_KEY});
    confirm("confirm-account", QConfirm::DeleteAccount, {});
    confirm("confirm-unknown", QConfirm::UnknownUser, {});
}

void toasts()
{
    Stage stage;
    QToastWidget toast(&stage);
    toast.showText("Post successfully!");
    stage.save("toast");
    toast.showText(longText("There is a great deal to say about this. "));
    stage.save("toast-long");
}

void keyboards()
{
    const int comment = QPopUpForm::POPUP_FORM_COMMENT_INPUT;
    input("keyboard", comment, false, [](KeyRobot &) {});
    input("keyboard-mail", QPopUpForm::POPUP_FORM_TEXT_INPUT, false,
          [](KeyRobot &robot) { robot.type(QStringLiteral("größe.tv+photos_2@example.org")); });
    input("keyboard-password", QPopUpForm::POPUP_FORM_TEXT_INPUT, true,
          [](KeyRobot &robot) { robot.type(QStringLiteral("Tr0ub4dor&3")); });
    input("keyboard-comment", comment, false, [](KeyRobot &robot) {
        robot.type(QStringLiteral("What a day!\nWe must go there again. :)\nOr: :D"));
        robot.press(CursorUpKey);
    });
    input("keyboard-search", QPopUpForm::POPUP_FORM_SEARCH_INPUT, false,
          [](KeyRobot &robot) { robot.type(QStringLiteral("harbour")); });
    for (int page = 0; page < kPageCount; ++page) {
        input(QStringLiteral("keyboard-page-%1").arg(page), QPopUpForm::POPUP_FORM_TAG_INPUT, false,
              [page](KeyRobot &robot) {
                  robot.keyboard()->setPage(KeyboardPage(page));
                  robot.keyboard()->setFocusIndex(page * 9);
              });
    }
}

void setUp(const QString &scale)
{
    static QTemporaryFile config;
    config.open();
    config.write("[Layout]\nScale=" + scale.toLatin1() +
                 "\nborder_left=64\nborder_right=64\nborder_top=36\nborder_bottom=36\n"
                 "[Font]\nAppNormal=15\nMessage=15\nMenu=16\nButton=15\nTitle=26\n");
    config.flush();
    SystemConfig::setConfigFile(config.fileName());
}

} // namespace

int main(int argc, char *argv[])
{
    if (argc < 2) {
        QTextStream(stderr) << "usage: orvala-gallery FOLDER [SCALE]\n";
        return 2;
    }
    qputenv("QT_QPA_PLATFORM", "offscreen");
    setUp(QString::fromLocal8Bit(argc > 2 ? argv[2] : "1"));
    prepareScale();
    QApplication application(argc, argv);
    applyScale();
    initResources();
    const int font = QFontDatabase::addApplicationFont(QStringLiteral(ORVALA_FONT_FILE));
    if (font >= 0)
        application.setFont(QFont(QFontDatabase::applicationFontFamilies(font).first()));
    SystemConfig::mScreen_Width = 1280;
    SystemConfig::mScreen_Height = 720;
    AccountManagerHelper::setUserName(QStringLiteral("Anna Maria Featherstone"));
    outputFolder = QString::fromLocal8Bit(argv[1]);
    QDir().mkpath(outputFolder);
    dialogs();
    toasts();
    keyboards();
    return 0;
}
