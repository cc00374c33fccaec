#pragma once

#include "platform/Encoding.h"

#include <string>

namespace dovrel {

// UTF-8 text made safe for a terminal and for line-oriented output: every C0
// control (including TAB, LF and CR), DEL and every C1 control (U+0080 to
// U+009F) becomes U+FFFD, so a text can neither move the cursor, send an
// escape sequence nor end or split a line.
std::string TerminalText(const Utf8& utf8);

} // namespace dovrel
