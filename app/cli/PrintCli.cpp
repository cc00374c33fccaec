#include "app/cli/PrintCommand.h"
#include "app/cli/Subcommands.h"

#include <iostream>
#include <limits>
#include <memory>

namespace dovrel {

void AddPrint(CLI::App& app, Runner& run) {
    auto options = std::make_shared<PrintOptions>();
    auto today = std::make_shared<std::string>();
    CLI::App* print = app.add_subcommand(
        "print", "Write the page of a document (or of several) and open it in the browser");
    print->add_option("COMPDIR", options->compDir, "Company directory")->required();
    AddTypeOption(*print, options->type);
    print->add_option("--start", options->start, "First record to look at (default 2)")
        ->check(CLI::Range(1, std::numeric_limits<int32_t>::max()));
    print
        ->add_option("--count", options->count,
                     "Documents to print from the first one found (default 1)")
        ->check(CLI::Range(1, std::numeric_limits<int32_t>::max()));
    print
        ->add_option("--lang", options->lang,
                     "0 Hebrew, 1 English, 2 Hebrew without amounts (default: as saved)")
        ->check(CLI::Range(0, 2));
    print->add_option("--out", options->out,
                      "The page file (one document) or an existing folder (several)");
    print->add_flag_callback(
        "--no-open", [options] { options->open = false; }, "Do not open the page in the browser");
    AddTodayOption(*print, *today, "Today's date on the page");
    print->callback([options, today, &run] {
        run = [options, today] {
            if (!today->empty())
                options->today = PrintCommand::ParseDay(*today);
            SqliteSettingsStore settings;
            XdgOpenBrowser browser;
            RecordingBrowser none;
            bool open = options->open && options->count == 1;
            ModuleState state;
            PrintCommand command(*options, settings, open ? static_cast<Browser&>(browser) : none,
                                 state);
            return command.run(std::cout, std::cerr);
        };
    });
}

} // namespace dovrel
