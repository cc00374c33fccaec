#include "app/cli/PicturesCommand.h"
#include "app/cli/Subcommands.h"

#include <iostream>
#include <memory>

namespace dovrel {

namespace {

// The usage line shows a positional with several forms as its own text.
class FormsInUsage : public CLI::Formatter {
public:
    std::string make_option_usage(const CLI::Option* opt) const override {
        return opt->get_option_text().empty() ? Formatter::make_option_usage(opt)
                                              : opt->get_option_text();
    }
};

} // namespace

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
        ->add_flag("--force", options->force,
                   "Replace a database that holds ranges, or a file that is not one");
    pictures->add_subcommand("list", "Print the ranges by RangeID")
        ->add_flag("--json", options->json, "Print them as JSON");
    CLI::App* add = pictures->add_subcommand("add", "Add a range of item keys and category codes");
    add->formatter(std::make_shared<FormsInUsage>());
    add->add_option("ARGS", options->args, "Without FROMCAT TOCAT the range takes every code")
        ->option_text("FROMKEY TOKEY [FROMCAT TOCAT] PICFILE")
        ->expected(3, 5)
        ->required();
    pictures->add_subcommand("delete", "Delete a range by its RangeID")
        ->add_option("RANGEID", options->args, "The range's number")
        ->expected(1)
        ->required();
    CLI::App* which =
        pictures->add_subcommand("which", "The picture a line with ITEMKEY and CATCODE gets");
    which->formatter(std::make_shared<FormsInUsage>());
    which->add_option("ARGS", options->args, "An item key and a category code")
        ->option_text("ITEMKEY CATCODE")
        ->expected(2)
        ->required();
    pictures->add_subcommand("export", "Write the ranges to a CSV file")
        ->add_option("FILE", options->args, "The CSV file")
        ->expected(1)
        ->required();
    CLI::App* import =
        pictures->add_subcommand("import", "Replace every range with those of a CSV file");
    import->add_option("FILE", options->args, "The CSV file, with or without its heading")
        ->expected(1)
        ->required();
    import->add_flag("--force", options->force, "Import a file without ranges: delete them all");
    pictures->callback([options, pictures, &run] {
        options->action = pictures->get_subcommands().front()->get_name();
        run = [options] {
            SqliteSettingsStore store;
            return PicturesCommand(*options, store).run(std::cout, std::cerr);
        };
    });
}

} // namespace dovrel
