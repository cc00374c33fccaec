#include "app/cli/AccountCommand.h"
#include "app/cli/CompaniesCommand.h"
#include "app/cli/Subcommands.h"

#include <iostream>
#include <memory>

namespace dovrel {

void AddCompanies(CLI::App& app, Runner& run) {
    auto options = std::make_shared<CompaniesOptions>();
    CLI::App* companies =
        app.add_subcommand("companies", "List the companies found directly below a directory");
    companies->add_option("MAINDIR", options->mainDir, "Main directory to scan")->required();
    companies->add_flag("--json", options->json, "Print a JSON array of {name, path}");
    companies->callback([options, &run] {
        run = [options] { return CompaniesCommand(*options).run(std::cout, std::cerr); };
    });
}

void AddAccount(CLI::App& app, Runner& run) {
    auto options = std::make_shared<AccountOptions>();
    CLI::App* account =
        app.add_subcommand("account", "Show the phones, details and district of an account");
    account->add_option("COMPDIR", options->compDir, "Company directory")->required();
    account->add_option("KEY", options->key, "Account key")->required();
    account->add_flag("--json", options->json, "Print a JSON object");
    account->callback(
        [options, &run] { run = [options] { return AccountCommand(*options).run(std::cout); }; });
}

} // namespace dovrel
