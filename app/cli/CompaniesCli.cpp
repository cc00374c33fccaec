#include "app/cli/Subcommands.h"

namespace dovrel {

void AddCompanies(CLI::App&, Runner&) {}

void AddAccount(CLI::App&, Runner&) {}

} // namespace dovrel
