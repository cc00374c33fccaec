#pragma once

#include "platform/Path.h"

namespace dovrel {

// Checks that a company directory named on the command line is there and can
// be read. A missing one is a CommandError "not found"; one that cannot be
// looked at or read is an Error with the system's reason.
void CheckCompanyDir(const Path& dir);

} // namespace dovrel
