#include "app/cli/HostSession.h"

#include "app/cli/CardMembers.h"
#include "app/cli/StateJson.h"
#include "fixfiles/AccountsFile.h"
#include "fixfiles/CompanyFile.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Error.h"

#include <istream>
#include <limits>
#include <ostream>

namespace dovrel {

using nlohmann::json;

namespace {

constexpr int64_t kInt16Min = std::numeric_limits<int16_t>::min();
constexpr int64_t kInt16Max = std::numeric_limits<int16_t>::max();

bool IsBlank(std::string_view line) {
    return line.find_first_not_of(" \t\r\n") == std::string_view::npos;
}

json Failure(const std::string& description) {
    return {{"ok", false}, {"error", description}};
}

} // namespace

HostSession::HostSession(ModuleState& shared) : card_(messages_, shared) {
    addCardCommands();
    addFileCommands();
}

void HostSession::addCommand(const std::string& name, Command command) {
    commands_[name] = std::move(command);
}

std::optional<std::string> HostSession::handle(std::string_view line) {
    if (IsBlank(line))
        return std::nullopt;
    json reply;
    try {
        json request = json::parse(line);
        reply = answer(request);
    } catch (const json::parse_error& e) {
        reply = Failure(std::string("Bad JSON: ") + e.what());
    } catch (const std::exception& e) {
        reply = Failure(e.what());
    } catch (...) {
        reply = Failure("Unknown failure");
    }
    return StateJson::Dump(reply);
}

json HostSession::answer(const json& request) {
    if (!request.is_array() || request.empty() || !request[0].is_string())
        throw Error("A request is a JSON array that starts with the command's name");
    const std::string& name = request[0].get_ref<const std::string&>();
    auto found = commands_.find(name);
    if (found == commands_.end())
        throw Error("Unknown command: " + name);
    json args(request.begin() + 1, request.end());
    messages_.take();
    json reply = found->second(*this, HostArgs(name, args));
    reply["ok"] = true;
    reply["messages"] = StateJson::Messages(messages_.take());
    reply["state"] = StateJson::Build(card_);
    return reply;
}

int HostSession::serve(std::istream& in, std::ostream& out) {
    std::string line;
    while (std::getline(in, line)) {
        std::optional<std::string> reply = handle(line);
        if (!reply)
            continue;
        out << *reply << '\n';
        out.flush();
        if (!out)
            return 1;
    }
    return 0;
}

void HostSession::addCardCommands() {
    addCommand("set", [](HostSession& session, const HostArgs& args) {
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
        return json{{"result",
                     {{"Key", StateJson::Text(entry.Key)},
                      {"Phone", StateJson::Text(entry.Phone)},
                      {"Details", StateJson::Text(entry.Details)},
                      {"District", StateJson::Text(entry.District)}}}};
    });
    addCommand("ReadAdf", [](HostSession& session, const HostArgs& args) {
        args.expectCount(1);
        return json{
            {"result", ReadAdf(args.text(0, "company path"), session.card().shared().Company)}};
    });
    addCommand("CurrencyNames", [](HostSession& session, const HostArgs& args) {
        args.expectCount(1);
        auto code = static_cast<int16_t>(args.integer(0, "currency code", kInt16Min, kInt16Max));
        auto [hebrew, printed] = CurrencyNames(code, session.card().shared().Company);
        return json{{"result", json::array({StateJson::Text(hebrew), StateJson::Text(printed)})}};
    });
}

} // namespace dovrel
