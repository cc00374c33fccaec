#pragma once

#include "app/session/HostArgs.h"
#include "app/session/HostForms.h"
#include "control/Card.h"
#include "control/ModuleState.h"
#include "platform/Browser.h"
#include "platform/Clipboard.h"
#include "platform/Clock.h"
#include "platform/Messages.h"
#include "platform/SettingsStore.h"

#include <array>
#include <functional>
#include <iosfwd>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include <nlohmann/json.hpp>

namespace dovrel {

// The automation host: controls driven by JSON requests, one request per
// line (an array: the command's name, then its arguments), one answer per
// line (an object). A failing request answers {"ok": false, "error": ...}
// and the session goes on. The session starts with one control, made and
// started as by ["new", {}]; a second one on the same thread (["new2"]) shares
// its module state, and ["use", 1 | 2] picks which one later requests go to.
class HostSession {
public:
    // Who shows the controls' message boxes and side forms, when not the
    // session's own recorder and script; and the container's page elements
    // the first control starts in.
    struct Setup {
        Messages* messages = nullptr;
        FormPresenter* forms = nullptr;
        nlohmann::json elements = nlohmann::json::object();
    };

    // A command takes the request's arguments and returns the members it adds
    // to the answer ("result", "value"), or an empty object. The session adds
    // "ok", the message boxes the call showed and the control's state.
    using Command = std::function<nlohmann::json(HostSession&, const HostArgs&)>;

    // Settings kept in memory: nothing the user stored is read or changed.
    explicit HostSession(ModuleState& shared);
    HostSession(std::unique_ptr<SettingsStore> settings, ModuleState& shared);
    HostSession(std::unique_ptr<SettingsStore> settings, ModuleState& shared, const Setup& setup);
    ~HostSession();

    // The answer to one input line, blank or not: one line of JSON. A line that
    // is not one whole JSON value gets an error answer.
    std::string handle(std::string_view line);
    // Answers every line of in on out, flushing after each, until the end of
    // the input. Returns the exit code.
    int serve(std::istream& in, std::ostream& out);

    void addCommand(const std::string& name, Command command);
    // Runs one request's command and gives the members it adds to the answer.
    nlohmann::json run(const nlohmann::json& request);

    // The control later requests go to.
    Card& card() { return *cards_[current_]; }
    RecordedMessages& messages() { return messages_; }
    MemoryClipboard& clipboard() { return clipboard_; }
    RecordingBrowser& browser() { return browser_; }
    // Fixes today's date of the pages.
    void setToday(CivilDate today) { clock_.fix(today); }
    HostForms& forms() { return forms_; }

private:
    nlohmann::json answer(const nlohmann::json& request);
    // Makes control 1 or 2 afresh, in a container with the given page elements.
    void newCard(size_t slot, const nlohmann::json& elements);
    void use(size_t slot);
    void addCardCommands();
    void addEventCommands();
    void addFileCommands();

    RecordedMessages messages_;
    Messages* shownMessages_;
    FormPresenter* shownForms_;
    std::unique_ptr<SettingsStore> settings_;
    MemoryClipboard clipboard_;
    RecordingBrowser browser_;
    SettableClock clock_;
    HostForms forms_;
    ModuleState& shared_;
    std::array<std::unique_ptr<Card>, 2> cards_;
    size_t current_ = 0;
    std::map<std::string, Command> commands_;
};

} // namespace dovrel
