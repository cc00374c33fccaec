#include "app/cli/ExitCode.h"
#include "app/cli/PrintCommand.h"
#include "app/cli/SettingsCommand.h"
#include "app/cli/ShowCommand.h"
#include "app/cli/Subcommands.h"
#include "app/session/HostSession.h"
#include "platform/TerminalText.h"

#include <CLI/CLI.hpp>

#include <cerrno>
#include <cstdint>
#include <cstdio>
#include <cstring>
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
    dovrel::AddTypeOption(*show, options->type);
    show->add_option("--start", options->start, "First record to look at (default 2)")
        ->check(CLI::Range(1, std::numeric_limits<int32_t>::max()));
    show->add_flag("--json", options->json,
                   "Print the document as JSON, one record of dovrel export");
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
    dovrel::AddTodayOption(*host, *today, "Today's date on printed pages");
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

const char* const kExitCodes =
    "Exit codes: 0 done, 1 failed, 2 usage (a wrong command line), 3 nothing found (no such "
    "document, account, company, range or setting), 4 done but damaged documents were skipped "
    "(export, print).\n";

// A first word that is not a command gets its own message, with the commands.
bool UnknownCommand(CLI::App& app, int argc, char** argv) {
    if (argc < 2 || argv[1][0] == '-')
        return false;
    std::string word = argv[1];
    std::string names;
    for (const CLI::App* command : app.get_subcommands({})) {
        if (command->get_name() == word)
            return false;
        names += (names.empty() ? "" : ", ") + command->get_name();
    }
    std::cerr << "dovrel: unknown command \"" << dovrel::TerminalText(dovrel::ValidUtf8(word))
              << "\"; the commands are " << names << " (dovrel --help tells more)\n";
    return true;
}

// Everything written to standard output must have reached it.
int Finish(int code) {
    std::cout.flush();
    if (std::cout && std::fflush(stdout) == 0 && !std::ferror(stdout))
        return code;
    std::cerr << "dovrel: cannot write the output: " << std::strerror(errno) << '\n';
    return dovrel::kExitFailed;
}

int Run(const Runner& run) {
    try {
        return Finish(run ? run() : dovrel::kExitUsage);
    } catch (const dovrel::CommandError& e) {
        std::cerr << "dovrel: " << dovrel::TerminalText(dovrel::ErrorText(e)) << '\n';
        return Finish(e.code());
    } catch (const std::bad_alloc&) {
        std::cerr << "dovrel: out of memory\n";
    } catch (const std::exception& e) {
        std::cerr << "dovrel: " << dovrel::TerminalText(dovrel::ErrorText(e)) << '\n';
    } catch (...) {
        std::cerr << "dovrel: unknown failure\n";
    }
    Finish(dovrel::kExitFailed);
    return dovrel::kExitFailed;
}

} // namespace

int main(int argc, char** argv) {
    CLI::App app{"dovrel: view the stock documents of a company of the accounting system"};
    app.set_version_flag("--version", std::string("dovrel ") + DOVREL_VERSION);
    app.require_subcommand(1);
    app.footer(kExitCodes);
    Runner run;
    AddShow(app, run);
    AddHost(app, run);
    AddSettings(app, run);
    dovrel::AddPrint(app, run);
    dovrel::AddCompanies(app, run);
    dovrel::AddAccount(app, run);
    dovrel::AddPictures(app, run);
    dovrel::AddServe(app, run);
    dovrel::AddExport(app, run);
    if (UnknownCommand(app, argc, argv))
        return dovrel::kExitUsage;
    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError& e) {
        int code = app.exit(e);
        return code == 0 ? dovrel::kExitDone : dovrel::kExitUsage;
    }
    return Run(run);
}
