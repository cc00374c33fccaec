#pragma once

#include "platform/SettingsStore.h"

#include <iosfwd>
#include <string>

namespace dovrel {

struct SettingsOptions {
    std::string app = "Dovrel"; // UTF-8, as typed
    std::string action;         // "list", "get", "set" or "unset"
    std::string key;            // UTF-8
    std::string value;          // UTF-8, for "set"
};

// `dovrel settings`: lists, reads, saves and removes the control's settings (section
// "Params") of one application name in the settings store. Output is UTF-8.
class SettingsCommand {
public:
    static constexpr const char* kSection = "Params";

    SettingsCommand(SettingsOptions options, SettingsStore& store);

    // Exit code: 0 done, 3 when `get` or `unset` finds no such key.
    int run(std::ostream& out, std::ostream& err);

private:
    int list(std::ostream& out);
    int get(std::ostream& out, std::ostream& err);
    int unset(std::ostream& err);
    int noSetting(std::ostream& err) const;

    SettingsOptions options_;
    SettingsStore& store_;
    std::string app_; // code page 1255
    std::string key_; // code page 1255
};

} // namespace dovrel
