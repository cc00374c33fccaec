#pragma once

#include "platform/Encoding.h"

#include <exception>
#include <stdexcept>
#include <string>

namespace dovrel {

// A run-time error of the system: it ends the current routine and travels to
// the caller, which either reports it (the long file and database work) or
// lets it reach the host. The description is UTF-8 text meant for a person.
class Error : public std::runtime_error {
public:
    explicit Error(const std::string& description) : std::runtime_error(description) {}
};

// A failure's description for a person, as valid UTF-8: what every message
// box and the terminal show of an error.
Utf8 ErrorText(const std::exception& failure);

// The description of errno after a failed system call on a file, as
// "<what> <path>: <reason>".
[[noreturn]] void ThrowSystemError(const std::string& what, const std::string& path, int err);

// Runs step and ignores any failure in it: the handlers that go on with
// their next step after a failure run each step through this.
template <typename Step> void IgnoringErrors(Step&& step) noexcept {
    try {
        step();
    } catch (...) {
    }
}

} // namespace dovrel
