#include "app/cli/Subcommands.h"

namespace dovrel {

void AddPrint(CLI::App&, Runner&) {}

} // namespace dovrel
