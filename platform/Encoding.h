#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dovrel {

// Text in UTF-8, as people and programs outside see it (the terminal, JSON,
// widgets, error messages). It is made only on purpose and never turns into a
// std::string by itself, so the compiler keeps it apart from the core's code
// page 1255 strings.
class Utf8 {
public:
    Utf8() = default;
    explicit Utf8(std::string bytes) : bytes_(std::move(bytes)) {}
    explicit Utf8(const char* bytes) : bytes_(bytes) {}
    explicit Utf8(std::string_view bytes) : bytes_(bytes) {}

    const std::string& str() const { return bytes_; }
    std::string_view view() const { return bytes_; }
    bool empty() const { return bytes_.empty(); }

    Utf8& operator+=(const Utf8& more) {
        bytes_ += more.bytes_;
        return *this;
    }
    friend Utf8 operator+(Utf8 text, const Utf8& more) { return text += more; }
    friend bool operator==(const Utf8&, const Utf8&) = default;

private:
    std::string bytes_;
};

// Inside the core every text is a string of single bytes in the Windows
// Hebrew code page 1255. These functions are the only place where text
// crosses to and from UTF-8 (command output, JSON, widgets, SQLite).

// Code page 1255 bytes to UTF-8, without loss: every byte becomes its own
// character. Control bytes stay the control characters they are; a byte the
// code page leaves undefined becomes the character of the same number
// (0x81 -> U+0081), which no defined byte uses. FromUtf8 undoes it exactly.
Utf8 ToUtf8(std::string_view cp1255);

// UTF-8 to code page 1255. A character the code page cannot hold, or a
// malformed UTF-8 sequence, becomes "?".
std::string FromUtf8(const Utf8& utf8);

// Code page 1255 bytes to UTF-8 for a terminal or line-oriented output: as
// ToUtf8, but every control character (C0 with TAB, LF and CR, DEL, C1)
// becomes U+FFFD, so stored bytes can neither move the cursor, change the
// terminal's state nor start a line. TerminalText does the same for UTF-8.
std::string ToTerminal(std::string_view cp1255);

// The Unicode code points of bytes that should be UTF-8, with -1 for each
// malformed sequence: the one UTF-8 decoder, under the functions here.
std::vector<int32_t> CodePoints(std::string_view bytes);

// Bytes that should be UTF-8 (a file name, an error's description) as valid
// UTF-8: each malformed sequence becomes U+FFFD.
Utf8 ValidUtf8(std::string_view bytes);

} // namespace dovrel
