#pragma once

#include <iosfwd>
#include <string>

namespace dovrel {

struct AccountOptions {
    std::string compDir; // UTF-8, as typed
    std::string key;     // UTF-8; surrounding spaces do not count
    bool json = false;
};

// `dovrel account`: the phones, details and district of one account of a
// company, as the account details window shows them: "ריק" in all three when
// the key is not in the accounts file. Output is UTF-8: three captioned
// lines, or a JSON object {"key", "found", "phone", "details", "district"}.
class AccountCommand {
public:
    explicit AccountCommand(AccountOptions options) : options_(std::move(options)) {}

    // Exit code 0 when found, 3 when not; a missing or unreadable accounts
    // file is an Error.
    int run(std::ostream& out);

private:
    AccountOptions options_;
};

} // namespace dovrel
