#pragma once

#include <string>
#include <string_view>

namespace dovrel {

// Inside the core every text is a string of single bytes in the Windows
// Hebrew code page 1255. These functions are the only place where text
// crosses to and from UTF-8 (command output, JSON, widgets, SQLite).

// Code page 1255 bytes to UTF-8, without loss: every byte becomes its own
// character. Control bytes stay the control characters they are; a byte the
// code page leaves undefined becomes the character of the same number
// (0x81 -> U+0081), which no defined byte uses. FromUtf8 undoes it exactly.
std::string ToUtf8(std::string_view cp1255);

// UTF-8 to code page 1255. A character the code page cannot hold, or a
// malformed UTF-8 sequence, becomes "?".
std::string FromUtf8(std::string_view utf8);

// Code page 1255 bytes to UTF-8 for a terminal or line-oriented output: as
// ToUtf8, but every control character (C0 with TAB, LF and CR, DEL, C1)
// becomes U+FFFD, so stored bytes can neither move the cursor, change the
// terminal's state nor start a line. TerminalText does the same for UTF-8.
std::string ToTerminal(std::string_view cp1255);

// Bytes that should be UTF-8 (a file name, say) as valid UTF-8: each
// malformed sequence becomes U+FFFD.
std::string ValidUtf8(std::string_view bytes);

} // namespace dovrel
