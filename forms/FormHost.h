#pragma once

#include <string>

namespace dovrel {

class Clipboard;
class Messages;
struct AccountEntry;

// What the company chooser and the account details window need from the
// control that opens them. The pieces of module state it gives live as long
// as the forms do.
class FormHost {
public:
    virtual Messages& formMessages() = 0;
    virtual Clipboard& formClipboard() = 0;
    // The company directory the chooser sets.
    virtual std::string& companyDirectory() = 0;
    // The account the account button last looked up.
    virtual const AccountEntry& currentAccount() const = 0;

protected:
    ~FormHost() = default;
};

} // namespace dovrel
