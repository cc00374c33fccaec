#include "app/cli/ExportCommand.h"
#include "app/cli/Subcommands.h"

#include <iostream>
#include <memory>

#include <unistd.h>

namespace dovrel {

void AddExport(CLI::App& app, Runner& run) {
    auto options = std::make_shared<ExportCliOptions>();
    auto allTypes = std::make_shared<bool>(false);
    CLI::App* command = app.add_subcommand(
        "export", "Write every document of the chosen types as JSON Lines or CSV");
    command->add_option("COMPDIR", options->compDir, "Company directory")->required();
    AddTypesOption(*command, options->types);
    command->add_flag("--all-types", *allTypes, "Every document type (the default)");
    command->add_option("--from-date", options->fromDate, "Documents dated on or after this day")
        ->type_name("DD/MM/YYYY");
    command->add_option("--to-date", options->toDate, "Documents dated on or before this day")
        ->type_name("DD/MM/YYYY");
    command->add_option("--format", options->format, "jsonl (default) or csv")
        ->check(CLI::IsMember({"jsonl", "csv"}));
    command->add_option("--output", options->output,
                        "The file to write (default: standard output)");
    command->add_flag_callback(
        "--no-bom", [options] { options->bom = false; }, "CSV without the UTF-8 byte-order mark");
    command->callback([options, allTypes, &run] {
        if (*allTypes)
            options->types.clear();
        run = [options] {
            ExportCommand exporter(*options);
            if (isatty(STDERR_FILENO))
                exporter.setProgress(&std::cerr);
            return exporter.run(std::cout, std::cerr);
        };
    });
}

} // namespace dovrel
