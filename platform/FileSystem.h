#pragma once

#include "platform/Path.h"

#include <optional>
#include <string>
#include <string_view>

namespace dovrel {

// Turns a path of the accounting system's kind into the file system's own
// name of it. Both "\" and "/" separate components. A component that does
// not exist as written is matched without regard to letter case (DOS files are often upper case
// while the program asks for "ITM.fix"); when several entries match, the one that sorts first is
// taken, so the choice is stable. Components that match nothing are kept as written.
Path ResolvePath(const Path& path);

// True when the path, resolved as above, names an existing regular file.
bool FileExists(const Path& path);

} // namespace dovrel
