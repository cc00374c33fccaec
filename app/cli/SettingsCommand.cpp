#include "app/cli/SettingsCommand.h"

#include "app/cli/ExitCode.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/TerminalText.h"

#include <ostream>
#include <utility>

namespace dovrel {

SettingsCommand::SettingsCommand(SettingsOptions options, SettingsStore& store)
    : options_(std::move(options)), store_(store), app_(FromUtf8(Utf8(options_.app))),
      key_(FromUtf8(Utf8(options_.key))) {}

int SettingsCommand::run(std::ostream& out, std::ostream& err) {
    if (app_.empty())
        throw Error("The application name must not be empty");
    if (options_.action == "list")
        return list(out);
    if (key_.empty())
        throw Error("The key must not be empty");
    if (options_.action == "get")
        return get(out, err);
    if (options_.action == "set") {
        store_.SaveSetting(app_, kSection, key_, FromUtf8(Utf8(options_.value)));
        return 0;
    }
    if (options_.action == "unset")
        return unset(err);
    throw Error("Unknown settings action: " + options_.action);
}

int SettingsCommand::list(std::ostream& out) {
    for (const auto& [key, value] : store_.ListSettings(app_, kSection))
        out << ToTerminal(key) << '=' << ToTerminal(value) << '\n';
    return 0;
}

int SettingsCommand::get(std::ostream& out, std::ostream& err) {
    std::optional<std::string> value = store_.FindSetting(app_, kSection, key_);
    if (!value)
        return noSetting(err);
    out << ToTerminal(*value) << '\n';
    return 0;
}

int SettingsCommand::unset(std::ostream& err) {
    return store_.DeleteSetting(app_, kSection, key_) ? 0 : noSetting(err);
}

int SettingsCommand::noSetting(std::ostream& err) const {
    err << "No setting \"" << ToTerminal(key_) << "\" under " << ToTerminal(app_) << '\n';
    return kExitNotFound;
}

} // namespace dovrel
