#pragma once

#include "platform/Encoding.h"

#include <string>
#include <string_view>

namespace dovrel {

// A file-system path as the system names it: native bytes, never converted,
// so any name the system allows reaches open() as it was given. It is made
// only on purpose (explicit constructor) and never turns into text by itself.
class Path {
public:
    Path() = default;
    explicit Path(std::string native) : native_(std::move(native)) {}

    const std::string& native() const { return native_; }
    const char* c_str() const { return native_.c_str(); }
    bool empty() const { return native_.empty(); }

    // The name for people (messages, the terminal, JSON): UTF-8, with bytes
    // that are not UTF-8 shown as U+FFFD.
    Utf8 shown() const;

    // This path followed by a name of the control's kind (code page 1255,
    // usually "\NAME.FIX").
    Path plus(std::string_view cp1255) const;

    friend bool operator==(const Path&, const Path&) = default;

private:
    std::string native_;
};

// The native path a path of the control's kind (code page 1255 text) names:
// the system's names are UTF-8.
Path PathFromCp1255(std::string_view cp1255);

} // namespace dovrel
