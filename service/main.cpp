#include "cli/commands.h"
#include "cli/serve.h"
#include "index/users.h"

#include <CLI/CLI.hpp>

#include <algorithm>
#include <iostream>

namespace {

void addData(CLI::App *command, std::string &data)
{
    command
        ->add_option("--data", data, "Folder with the service's index, certificate and thumbnails")
        ->capture_default_str();
}

void addGathered(CLI::App *command, ServiceSettings &service)
{
    std::vector<std::string> names = {"none"};
    for (const Gathered kind : allGatheredKinds())
        names.push_back(nameOf(kind));
    const auto choose = [&service](const std::vector<std::string> &chosen) {
        service.gathered.clear();
        for (const Gathered kind : allGatheredKinds()) {
            if (std::find(chosen.begin(), chosen.end(), nameOf(kind)) != chosen.end())
                service.gathered.insert(kind);
        }
    };
    command
        ->add_option_function<std::vector<std::string>>(
            "--gathered", choose,
            "Albums that the service gathers for each user from all their folders (all of them)")
        ->check(CLI::IsMember(names));
}

void addServe(CLI::App &program, ServeOptions &options, int &result)
{
    CLI::App *command = program.add_subcommand("serve", "Answer requests until SIGTERM");
    ServiceSettings &service = options.service;
    addData(command, service.data);
    command->add_option("--photos", options.photos, "Photo folder of the first user")
        ->check(CLI::ExistingDirectory);
    command->add_option("--user", options.user, "Mail of the first user, if there is none yet")
        ->check(CLI::Validator(mailProblem, "", "mail"))
        ->capture_default_str();
    command->add_option("--listen", service.listen, "Address to listen on")->capture_default_str();
    command->add_option("--port", service.port, "Port to listen on, 0 for a free one")
        ->check(CLI::Range(0, 65535))
        ->capture_default_str();
    command->add_option("--ready-file", options.readyFile,
                        "Gets the port once the service answers");
    auto *certificate =
        command->add_option("--certificate", service.certificate,
                            "Certificate chain (PEM); without it a self-signed one is made");
    command->add_option("--key", service.key, "The certificate's key (PEM)")->needs(certificate);
    command->add_flag("!--http", service.withTls, "No TLS, for measuring");
    command
        ->add_option("--threads", service.threads,
                     "Requests answered at the same time, a quarter of them for one address")
        ->check(CLI::Range(1, 1024))
        ->capture_default_str();
    command->add_option("--log-level", options.logLevel, "How much is logged")
        ->check(CLI::IsMember({"trace", "debug", "info", "warning", "error", "off"}))
        ->capture_default_str();
    command
        ->add_option_function<int>(
            "--rescan",
            [&service](int seconds) { service.scanPause = std::chrono::seconds(seconds); },
            "Seconds between scans of the photo folders (300)")
        ->check(CLI::Range(1, 86'400));
    command
        ->add_option_function<std::int64_t>(
            "--thumbnails",
            [&service](std::int64_t megabytes) { service.thumbnailBytes = megabytes << 20; },
            "Megabytes of made pictures that are kept (8192)")
        ->check(CLI::Range(1, 1 << 30));
    command
        ->add_option_function<int>(
            "--token-days",
            [&service](int days) { service.accessLife = std::chrono::hours(days * 24); },
            "Days for which a sign-in opens the feeds before it is renewed (90)")
        ->check(CLI::Range(1, 3650));
    addGathered(command, service);
    command->callback([&] { result = runServe(options); });
}

void addUsers(CLI::App &program, UserOptions &options, int &result)
{
    CLI::App *users = program.add_subcommand("user", "The people who have photos here");
    users->require_subcommand(1);
    CLI::App *add = users->add_subcommand("add", "Add a user, or change name and folder of one");
    CLI::App *list = users->add_subcommand("list", "Number, mail, name and folder of each user");
    CLI::App *remove = users->add_subcommand("remove", "Forget a user; photo files stay");
    CLI::App *token = users->add_subcommand("token", "Print tokens for a user, valid for 90 days");
    CLI::App *password = users->add_subcommand(
        "passwd", "Give a user a password, the first line of the input; ends their sign-ins");
    CLI::App *signOut = users->add_subcommand(
        "sign-out", "End a user's sign-ins on all screens, as when a television is lost");
    for (CLI::App *command : {add, list, remove, token, password, signOut})
        addData(command, options.data);
    for (CLI::App *command : {add, remove, token, password, signOut})
        command->add_option("mail", options.mail, "The user's mail address")->required();
    add->add_option("--name", options.name, "The name that others see")->required();
    add->add_option("--photos", options.photos, "The user's photo folder");
    add->add_flag("--password", options.readsPassword, "Read a password as passwd does");
    add->callback([&] { result = runUserAdd(options); });
    list->callback([&] { result = runUserList(options.data); });
    remove->callback([&] { result = runUserRemove(options.data, options.mail); });
    password->callback([&] { result = runUserPassword(options.data, options.mail); });
    signOut->callback([&] { result = runUserSignOut(options.data, options.mail); });
    token->callback([&] { result = runUserToken(options.data, options.mail); });
}

void addImport(CLI::App &program, std::string &data, std::string &file, std::string &folder,
               int &result)
{
    CLI::App *command =
        program.add_subcommand("import", "Bring in users, comments and tags from a JSON file");
    addData(command, data);
    command->add_option("file", file, "The file")->required();
    command->add_option("--photos", folder, "Folder that the paths in the file start at");
    command->callback([&] { result = runImport(data, file, folder); });
}

void addPhotos(CLI::App &program, std::string &data, int &result)
{
    CLI::App *command = program.add_subcommand("photos", "What the index says about photos");
    addData(command, data);
    command->add_flag("--unreadable", "List the files that cannot be shown, and why")->required();
    command->callback([&] { result = runUnreadable(data); });
}

int run(int argc, char **argv)
{
    CLI::App program("Serves folders of photos to the album browser.", "orvala-service");
    program.require_subcommand(1);
    program.set_config("--config", "", "Settings from a file, those of serve below a line [serve]");
    program.allow_config_extras(CLI::config_extras_mode::error);
    const std::string standardData = "orvala-data";
    ServeOptions serve;
    serve.service.data = standardData;
    UserOptions user{standardData, "", "", "", false};
    std::string data = standardData, file, folder;
    int result = 0;
    addServe(program, serve, result);
    addUsers(program, user, result);
    addImport(program, data, file, folder, result);
    addPhotos(program, data, result);
    CLI11_PARSE(program, argc, argv);
    return result;
}

} // namespace

int main(int argc, char **argv)
{
    try {
        return run(argc, argv);
    } catch (const std::exception &exception) { // as when the disk is full
        std::cerr << "orvala-service: " << exception.what() << "\n";
        return 1;
    }
}
