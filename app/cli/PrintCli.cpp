#include "app/cli/ExportCommand.h"
#include "app/cli/PrintCommand.h"
#include "app/cli/Subcommands.h"

#include <iostream>
#include <limits>
#include <map>
#include <memory>

#include <unistd.h>

namespace dovrel {

namespace {

// A word of a fixed list to its number; the numbers themselves are taken too.
CLI::Validator Words(const std::map<std::string, std::string>& words, const std::string& name) {
    return CLI::Validator(
        [words, name](std::string& text) {
            if (auto found = words.find(text); found != words.end())
                text = found->second;
            for (const auto& [word, number] : words)
                if (text == number)
                    return std::string();
            std::string list;
            for (const auto& [word, number] : words)
                list += (list.empty() ? "" : ", ") + word;
            return "not a " + name + ": " + text + " (one of " + list + ")";
        },
        "", name);
}

// The page choices of one run: each only when given, and none is saved.
void AddPageChoices(CLI::App& print, PrintOptions& options) {
    auto on = [&print](const char* flag, std::optional<bool>& choice, const char* about) {
        print.add_flag_callback(
            flag, [&choice] { choice = true; }, about);
    };
    on("--drawings", options.drawings, "Show the item drawings");
    on("--line-discount", options.lineDiscount, "Show the line discount column");
    on("--details", options.details, "Show the details column");
    print.add_flag_callback(
        "--no-details", [&options] { options.details = false; }, "Leave the details column out");
    on("--total-fc", options.totalFc, "Show the foreign-currency total");
    on("--foreign-names", options.foreignNames, "English page: the items' foreign names");
    print.add_option("--rules", options.rules, "Table rules: all, none, rows or cols")
        ->type_name("RULES")
        ->transform(Words({{"all", "0"}, {"none", "1"}, {"rows", "2"}, {"cols", "3"}}, "rule"));
    print.add_option("--title", options.title, "The page's title instead of the type's");
}

} // namespace

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
    print->add_flag("--all", options->all, "Every document of the type from the first one found");
    print
        ->add_option("--lang", options->lang,
                     "he (0) Hebrew, en (1) English, he-noprices (2) Hebrew without amounts "
                     "(default: as saved)")
        ->type_name("LANG")
        ->transform(Words({{"he", "0"}, {"en", "1"}, {"he-noprices", "2"}}, "page language"));
    print->add_option("--from-date", options->fromDate, "Only documents dated on or after this day")
        ->type_name("DD/MM/YYYY");
    print->add_option("--out", options->out, "The page file (one document) or a folder (several)");
    print->add_flag("--pdf", options->pdf, "Write PDF (made by Chromium) instead of HTML");
    print->add_flag_callback(
        "--no-open", [options] { options->open = false; }, "Do not open the page in the browser");
    AddPageChoices(*print, *options);
    AddTodayOption(*print, *today, "Today's date on the page");
    print->callback([options, today, &run] {
        run = [options, today] {
            if (!today->empty())
                options->today = PrintCommand::ParseDay(*today);
            if (!options->fromDate.empty())
                ExportCommand::ParseDate(options->fromDate);
            SqliteSettingsStore settings;
            XdgOpenBrowser browser;
            RecordingBrowser none;
            bool open = options->open && options->count == 1 && !options->all;
            ModuleState state;
            PrintCommand command(*options, settings, open ? static_cast<Browser&>(browser) : none,
                                 state);
            if (isatty(STDERR_FILENO))
                command.setProgress(&std::cerr);
            return command.run(std::cout, std::cerr);
        };
    });
}

} // namespace dovrel
