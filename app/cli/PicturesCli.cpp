#include "app/cli/Subcommands.h"

namespace dovrel {

void AddPictures(CLI::App&, Runner&) {}

} // namespace dovrel
