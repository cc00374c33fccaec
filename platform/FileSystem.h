#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace dovrel {

// Turns a path of the accounting system's kind, in code page 1255, into the
// file system's own (UTF-8) name of it. Both "\" and "/" separate components. A component that does
// not exist as written is matched without regard to letter case (DOS files are often upper case
// while the program asks for "ITM.fix"); when several entries match, the one that sorts first is
// taken, so the choice is stable. Components that match nothing are kept as written.
std::string ResolvePath(std::string_view path);

// True when the path (code page 1255, resolved as above) names an existing
// regular file.
bool FileExists(std::string_view path);

} // namespace dovrel
