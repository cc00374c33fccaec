#pragma once

#include <iosfwd>
#include <string>

namespace dovrel {

struct CompaniesOptions {
    std::string mainDir; // UTF-8, as typed
    bool json = false;
};

// `dovrel companies`: the companies the company chooser finds directly below
// a main directory, in the chooser's order, each with its name and its
// directory; companies with a blank name are left out, as the chooser's list
// leaves them. Output is UTF-8: one "NAME<TAB>PATH" line each, or a JSON
// array of {"name", "path"}.
class CompaniesCommand {
public:
    explicit CompaniesCommand(CompaniesOptions options) : options_(std::move(options)) {}

    // Exit code 0; a main directory that cannot be scanned is an Error.
    int run(std::ostream& out, std::ostream& err);

private:
    CompaniesOptions options_;
};

} // namespace dovrel
