#pragma once

#include "app/cli/HostArgs.h"
#include "control/Card.h"
#include "control/ModuleState.h"
#include "platform/Messages.h"

#include <functional>
#include <iosfwd>
#include <map>
#include <optional>
#include <string>
#include <string_view>

#include <nlohmann/json.hpp>

namespace dovrel {

// The automation host: one Card driven by JSON requests, one request per
// line (an array: the command's name, then its arguments), one answer per
// line (an object). A failing request answers {"ok": false, "error": ...}
// and the session goes on.
class HostSession {
public:
    // A command takes the request's arguments and returns the members it adds
    // to the answer ("result", "value"), or an empty object. The session adds
    // "ok", the message boxes the call showed and the control's state.
    using Command = std::function<nlohmann::json(HostSession&, const HostArgs&)>;

    explicit HostSession(ModuleState& shared = ModuleState::ofThisThread());

    // The answer to one input line; nothing for a blank line.
    std::optional<std::string> handle(std::string_view line);
    // Answers every line of in on out, flushing after each, until the end of
    // the input. Returns the exit code.
    int serve(std::istream& in, std::ostream& out);

    void addCommand(const std::string& name, Command command);

    Card& card() { return card_; }
    RecordedMessages& messages() { return messages_; }

private:
    nlohmann::json answer(const nlohmann::json& request);
    void addCardCommands();
    void addFileCommands();

    RecordedMessages messages_;
    Card card_;
    std::map<std::string, Command> commands_;
};

} // namespace dovrel
