#pragma once

#include <string>
#include <string_view>

namespace dovrel {

// Inside the core every text is a string of single bytes in the Windows
// Hebrew code page 1255. These two functions are the only place where text
// crosses to and from UTF-8 (command output, JSON, widgets, SQLite).

// Code page 1255 bytes to UTF-8. Bytes the code page leaves undefined and
// control bytes other than TAB, LF and CR become U+FFFD, so the result is
// always valid UTF-8.
std::string ToUtf8(std::string_view cp1255);

// UTF-8 to code page 1255. A character the code page cannot hold, or a
// malformed UTF-8 sequence, becomes "?".
std::string FromUtf8(std::string_view utf8);

} // namespace dovrel
