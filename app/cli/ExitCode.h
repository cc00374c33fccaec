#pragma once

#include "platform/Error.h"

#include <string>

namespace dovrel {

// The exit codes of every command.
enum ExitCode : int {
    kExitDone = 0,
    kExitFailed = 1,
    kExitUsage = 2,    // the command line itself is wrong
    kExitNotFound = 3, // no such document, account, company, range or setting
    kExitSkipped = 4,  // done, but damaged documents were reported and left out
};

// A failure that ends a command with a code other than 1.
class CommandError : public Error {
public:
    CommandError(ExitCode code, const std::string& description) : Error(description), code_(code) {}
    ExitCode code() const { return code_; }

private:
    ExitCode code_;
};

} // namespace dovrel
