#include "app/cli/PicturesCommand.h"
#include "app/cli/Subcommands.h"

#include <iostream>
#include <memory>

namespace dovrel {

void AddPictures(CLI::App& app, Runner& run) {
    auto options = std::make_shared<PicturesOptions>();
    CLI::App* pictures =
        app.add_subcommand("pictures", "List and change the item picture ranges of Dovrel.def");
    pictures->add_option("--db", options->db,
                         "Directory of Dovrel.def (default: the DBPath setting)");
    pictures->add_option("--app", options->app,
                         "Application name of the settings (default Dovrel)");
    pictures->require_subcommand(1);
    pictures->fallthrough();
    pictures->add_subcommand("init", "Make an empty picture database")
        ->add_flag("--force", options->force, "Replace a file that is not a picture database");
    pictures->add_subcommand("list", "Print the ranges by RangeID")
        ->add_flag("--json", options->json, "Print them as JSON");
    pictures->add_subcommand("add", "Add a range: FROMKEY TOKEY [FROMCAT TOCAT] PICFILE")
        ->add_option("ARGS", options->args)
        ->expected(3, 5)
        ->required();
    pictures->add_subcommand("delete", "Delete a range by its RangeID")
        ->add_option("RANGEID", options->args)
        ->required();
    pictures->add_subcommand("which", "The picture a line with ITEMKEY and CATCODE gets")
        ->add_option("ARGS", options->args)
        ->expected(2)
        ->required();
    pictures->add_subcommand("export", "Write the ranges to a CSV file")
        ->add_option("FILE", options->args)
        ->required();
    pictures->add_subcommand("import", "Replace every range with those of a CSV file")
        ->add_option("FILE", options->args)
        ->required();
    pictures->callback([options, pictures, &run] {
        options->action = pictures->get_subcommands().front()->get_name();
        run = [options] {
            SqliteSettingsStore store;
            return PicturesCommand(*options, store).run(std::cout, std::cerr);
        };
    });
}

} // namespace dovrel
