#include "app/cli/HostSession.h"
#include "app/cli/PrintCommand.h"
#include "app/cli/SettingsCommand.h"
#include "app/cli/ShowCommand.h"
#include "app/cli/Subcommands.h"

#include <CLI/CLI.hpp>

#include <cstdint>
#include <functional>
#include <iostream>
#include <limits>

#include <unistd.h>

namespace {

using dovrel::Runner;

// Each sub-command registers its options and, when chosen, the work to run.
void AddShow(CLI::App& app, Runner& run) {
    auto options = std::make_shared<dovrel::ShowOptions>();
    CLI::App* show = app.add_subcommand("show", "Print one document of a company");
    show->add_option("COMPDIR", options->compDir, "Company directory")->required();
    show->add_option("--type", options->type, "Document type code (default 20)")
        ->check(CLI::Range(0, static_cast<int>(std::numeric_limits<int16_t>::max())));
    show->add_option("--start", options->start, "First record to look at (default 2)")
        ->check(CLI::Range(1, std::numeric_limits<int32_t>::max()));
    show->add_flag("--json", options->json, "Print the control's state as JSON");
    show->callback([options, &run] {
        run = [options] {
            dovrel::ModuleState state;
            dovrel::ShowCommand command(*options, state);
            if (isatty(STDERR_FILENO))
                command.setProgress(&std::cerr);
            return command.run(std::cout, std::cerr);
        };
    });
}

void AddHost(CLI::App& app, Runner& run) {
    auto today = std::make_shared<std::string>();
    CLI::App* host = app.add_subcommand(
        "host", "Automation: one JSON request per input line, one JSON answer per output line");
    host->add_option("--today", *today, "Today's date on printed pages, YYYY-MM-DD");
    host->callback([today, &run] {
        run = [today] {
            dovrel::ModuleState state;
            dovrel::HostSession session(std::make_unique<dovrel::SqliteSettingsStore>(), state);
            if (!today->empty())
                session.setToday(dovrel::PrintCommand::ParseDay(*today));
            return session.serve(std::cin, std::cout);
        };
    });
}

void AddSettings(CLI::App& app, Runner& run) {
    auto options = std::make_shared<dovrel::SettingsOptions>();
    CLI::App* settings = app.add_subcommand("settings", "List, read, save or remove settings");
    settings->add_option("--app", options->app, "Application name (default Dovrel)");
    settings->require_subcommand(1);
    settings->fallthrough();
    settings->add_subcommand("list", "Print every KEY=VALUE");
    settings->add_subcommand("get", "Print the value of a key")
        ->add_option("KEY", options->key)
        ->required();
    CLI::App* set = settings->add_subcommand("set", "Save a value under a key");
    set->add_option("KEY", options->key)->required();
    set->add_option("VALUE", options->value)->required();
    settings->add_subcommand("unset", "Remove a key")->add_option("KEY", options->key)->required();
    settings->callback([options, settings, &run] {
        options->action = settings->get_subcommands().front()->get_name();
        run = [options] {
            dovrel::SqliteSettingsStore store;
            return dovrel::SettingsCommand(*options, store).run(std::cout, std::cerr);
        };
    });
}

} // namespace

int main(int argc, char** argv) {
    CLI::App app{"dovrel: view the stock documents of a company of the accounting system"};
    app.set_version_flag("--version", std::string("dovrel ") + DOVREL_VERSION);
    app.require_subcommand(1);
    Runner run;
    AddShow(app, run);
    AddHost(app, run);
    AddSettings(app, run);
    dovrel::AddPrint(app, run);
    dovrel::AddCompanies(app, run);
    dovrel::AddAccount(app, run);
    dovrel::AddPictures(app, run);
    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError& e) {
        int code = app.exit(e);
        return code == 0 ? 0 : 2;
    }
    try {
        return run ? run() : 2;
    } catch (const std::exception& e) {
        std::cerr << "dovrel: " << e.what() << '\n';
    } catch (...) {
        std::cerr << "dovrel: unknown failure\n";
    }
    return 1;
}
