#include "app/session/HostSession.h"

#include "app/session/CardMembers.h"
#include "app/session/StateJson.h"
#include "control/CardInterface.h"
#include "fixfiles/AccountsFile.h"
#include "fixfiles/CompanyFile.h"
#include "fixfiles/TextDecoding.h"
#include "forms/FormDesigns.h"
#include "platform/Encoding.h"
#include "platform/Error.h"

#include <istream>
#include <limits>
#include <ostream>

namespace dovrel {

using nlohmann::json;

namespace {

constexpr int64_t kInt16Min = std::numeric_limits<int16_t>::min();
constexpr int64_t kInt16Max = std::numeric_limits<int16_t>::max();

json Failure(const std::string& description) {
    return {{"ok", false}, {"error", description}};
}

} // namespace

HostSession::HostSession(ModuleState& shared)
    : HostSession(std::make_unique<MemorySettingsStore>(), shared) {}

HostSession::HostSession(std::unique_ptr<SettingsStore> settings, ModuleState& shared)
    : HostSession(std::move(settings), shared, Setup()) {}

HostSession::HostSession(std::unique_ptr<SettingsStore> settings, ModuleState& shared,
                         const Setup& setup)
    : shownMessages_(setup.messages ? setup.messages : &messages_), settings_(std::move(settings)),
      forms_([this](const json& request) { run(request); }), shared_(shared) {
    shownForms_ = setup.forms ? setup.forms : &forms_;
    addCardCommands();
    addEventCommands();
    addFileCommands();
    newCard(0, setup.elements);
}

HostSession::~HostSession() = default;

void HostSession::newCard(size_t slot, const json& elements) {
    if (!elements.is_object())
        throw Error("The page elements must be a JSON object");
    // The control that showed the form is still running its handler.
    if (forms_.showing())
        throw Error("A control cannot be made while one of its forms is shown");
    std::map<std::string, std::string> values;
    // A null element is one the page does not have; a number is its text.
    for (const auto& [id, value] : elements.items())
        if (!value.is_null())
            values[id] = value.is_string() ? HostArgs::Text(value, id) : value.dump();
    ElementsContainer container(std::move(values));
    CardServices services{*shownMessages_, *settings_, *shownForms_, clipboard_, browser_, clock_};
    cards_[slot] = std::make_unique<Card>(services, shared_);
    current_ = slot;
    cards_[slot]->UserControl_InitProperties(&container);
}

void HostSession::use(size_t slot) {
    if (!cards_[slot])
        throw Error("There is no control " + std::to_string(slot + 1) + "; make it with new2");
    current_ = slot;
}

void HostSession::addCommand(const std::string& name, Command command) {
    commands_[name] = std::move(command);
}

std::string HostSession::handle(std::string_view line) {
    json reply;
    try {
        // The JSON reader would take a NUL byte as the end of the text.
        if (line.find('\0') != std::string_view::npos)
            throw Error("Bad JSON: a request must not hold a NUL byte");
        json request = json::parse(line);
        reply = answer(request);
    } catch (const json::parse_error& e) {
        reply = Failure(std::string("Bad JSON: ") + e.what());
    } catch (const std::exception& e) {
        reply = Failure(e.what());
    } catch (...) {
        reply = Failure("Unknown failure");
    }
    if (!reply.contains("state"))
        reply["messages"] = StateJson::Messages(messages_.take());
    // The pages the call opened in the browser, which the host opens or
    // reads; a call that failed after opening one tells it too.
    if (!browser_.opened.empty()) {
        reply["opened"] = json::array();
        for (const std::string& path : browser_.opened)
            reply["opened"].push_back(ValidUtf8(path).str());
        browser_.opened.clear();
    }
    return StateJson::Dump(reply);
}

json HostSession::run(const json& request) {
    if (!request.is_array() || request.empty() || !request[0].is_string())
        throw Error("A request is a JSON array that starts with the command's name");
    const std::string& name = request[0].get_ref<const std::string&>();
    auto found = commands_.find(name);
    if (found == commands_.end())
        throw Error("Unknown command: " + name);
    json args(request.begin() + 1, request.end());
    return found->second(*this, HostArgs(name, args));
}

json HostSession::answer(const json& request) {
    messages_.take();
    json reply = run(request);
    reply["ok"] = true;
    reply["messages"] = StateJson::Messages(messages_.take());
    reply["state"] = StateJson::Build(card());
    return reply;
}

int HostSession::serve(std::istream& in, std::ostream& out) {
    std::string line;
    while (std::getline(in, line)) {
        out << handle(line) << '\n';
        out.flush();
        if (!out)
            return 1;
    }
    return 0;
}

void HostSession::addCardCommands() {
    addCommand("set", [](HostSession& session, const HostArgs& args) {
        if (args.size() == 4) {
            CardMembers::SetCell(session.card(), args.text(0, "name"), args);
            return json::object();
        }
        args.expectCount(2);
        CardMembers::Set(session.card(), args.text(0, "name"), args.at(1));
        return json::object();
    });
    addCommand("get", [](HostSession& session, const HostArgs& args) {
        args.expectCount(1);
        return json{{"value", CardMembers::Get(session.card(), args.text(0, "name"))}};
    });
    addCommand("state", [](HostSession&, const HostArgs& args) {
        args.expectCount(0);
        return json::object();
    });
    addCommand("new", [](HostSession& session, const HostArgs& args) {
        session.newCard(0, args.size() == 0 ? json::object() : args.at(0));
        return json::object();
    });
    addCommand("new2", [](HostSession& session, const HostArgs& args) {
        session.newCard(1, args.size() == 0 ? json::object() : args.at(0));
        return json::object();
    });
    addCommand("use", [](HostSession& session, const HostArgs& args) {
        args.expectCount(1);
        session.use(static_cast<size_t>(args.integer(0, "control number", 1, 2) - 1));
        return json::object();
    });
    addCommand("call", [](HostSession& session, const HostArgs& args) {
        std::string member = args.text(0, "member");
        std::vector<Variant> values;
        for (size_t i = 1; i < args.size(); ++i) {
            values.push_back(args.scalar(i, "argument"));
            // A folder name the code page cannot hold is kept, so that the
            // control's text of it still opens it.
            if (args.at(i).is_string())
                session.card().shared().Paths.text(Path(args.at(i).get<std::string>()));
        }
        Variant result = CardInterface::Invoke(session.card(), member, values);
        return json{{"result", StateJson::FromVariant(result)}};
    });
    addCommand("ReadStock", [](HostSession& session, const HostArgs& args) {
        args.expectCount(6);
        std::string compPath = args.text(0, "company path");
        auto row = static_cast<int16_t>(args.integer(1, "document type row", kInt16Min, kInt16Max));
        std::string searchBy = args.text(2, "search by");
        Variant searchValue = args.scalar(3, "search value");
        std::string direction = args.text(4, "direction");
        std::string fromDate = args.text(5, "from date");
        int32_t result =
            session.card().ReadStock(compPath, row, searchBy, searchValue, direction, fromDate);
        return json{{"result", result}};
    });
}

void HostSession::addEventCommands() {
    using Event = void (Card::*)(const std::string&);
    using FormEvent = void (Form::*)(const std::string&);
    // ["click", CONTROL] or, for an element of a form's control array,
    // ["click", "FORM.ARRAY", INDEX].
    auto event = [this](const char* name, Event onCard, FormEvent onForm) {
        addCommand(name, [onCard, onForm](HostSession& session, const HostArgs& args) {
            if (args.size() != 2)
                args.expectCount(1);
            std::string target = args.text(0, "control");
            size_t dot = target.find('.');
            if (args.size() == 2) {
                if (dot == std::string::npos)
                    throw Error(target + " is not a control array of a form");
                target = ArrayElementName(
                    target, static_cast<int32_t>(args.integer(1, "index", 0, kInt16Max)));
            }
            if (dot == std::string::npos) {
                (session.card().*onCard)(target);
            } else {
                Form& form = CardMembers::FindForm(session.card(), target.substr(0, dot));
                std::string control = target.substr(dot + 1);
                if (form.findControl(control) == nullptr)
                    throw Error("Unknown control: " + target);
                if (onForm)
                    (form.*onForm)(control);
            }
            return json::object();
        });
    };
    event("click", &Card::Click, &Form::Click);
    event("dblclick", &Card::DblClick, &Form::DblClick);
    event("lostfocus", &Card::LostFocus, nullptr);
    addCommand("modal", [](HostSession& session, const HostArgs& args) {
        args.expectCount(2);
        session.forms().queue(args.text(0, "form"), args.at(1));
        return json::object();
    });
    addCommand("answers", [](HostSession& session, const HostArgs& args) {
        args.expectCount(1);
        const json& answers = args.at(0);
        if (!answers.is_array())
            throw Error("answers: give a JSON array of \"yes\" and \"no\"");
        for (const json& answer : answers) {
            std::string word = answer.is_string() ? answer.get<std::string>() : std::string();
            if (word != "yes" && word != "no")
                throw Error("answers: each answer is \"yes\" or \"no\"");
        }
        for (const json& answer : answers)
            session.messages().queueAnswer(answer == "yes" ? MsgAnswer::Yes : MsgAnswer::No);
        return json::object();
    });
    addCommand("select", [](HostSession& session, const HostArgs& args) {
        if (args.size() != 3)
            args.expectCount(2);
        CardMembers::Select(session.card(), args.text(0, "control"), args);
        return json::object();
    });
    addCommand("clipboard", [](HostSession& session, const HostArgs& args) {
        args.expectCount(0);
        return json{{"result", StateJson::Text(session.clipboard().GetText())}};
    });
}

void HostSession::addFileCommands() {
    addCommand("ReadITM", [](HostSession& session, const HostArgs& args) {
        args.expectCount(1);
        std::string compPath = args.text(0, "company path");
        return json{{"result", StateJson::FromVariant(session.card().ReadITM(compPath))}};
    });
    addCommand("ReadACT", [](HostSession& session, const HostArgs& args) {
        args.expectCount(1);
        std::string compPath = args.text(0, "company path");
        return json{{"result", StateJson::FromVariant(session.card().ReadACT(compPath))}};
    });
    addCommand("FindAccount", [](HostSession& session, const HostArgs& args) {
        args.expectCount(1);
        AccountEntry entry = FindAccount(session.card().shared().Accounts, args.text(0, "key"));
        return json{{"result", StateJson::Account(entry)}};
    });
    addCommand("ReadAdf", [](HostSession& session, const HostArgs& args) {
        args.expectCount(1);
        return json{
            {"result", ReadAdf(session.card().shared().Paths.native(args.text(0, "company path")),
                               session.card().shared().Company)}};
    });
    addCommand("CurrencyNames", [](HostSession& session, const HostArgs& args) {
        args.expectCount(1);
        auto code = static_cast<int16_t>(args.integer(0, "currency code", kInt16Min, kInt16Max));
        auto [hebrew, printed] = CurrencyNames(code, session.card().shared().Company);
        return json{{"result", json::array({StateJson::Text(hebrew), StateJson::Text(printed)})}};
    });
}

} // namespace dovrel
