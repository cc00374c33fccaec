#include "app/web/WebSession.h"

#include "app/session/HostSession.h"
#include "app/session/StateJson.h"
#include "app/web/DesignJson.h"
#include "control/ModuleState.h"
#include "platform/Error.h"
#include "platform/FileReach.h"
#include "platform/ListControls.h"
#include "platform/TerminalText.h"

#include <fstream>
#include <iostream>
#include <iterator>
#include <set>

namespace dovrel {
namespace {

using nlohmann::json;

std::atomic<uint64_t> gNextId{1};

// What a page may ask of its control: the user's own actions and reading
// the state. Making controls or scripting answers is for the automation host.
const std::set<std::string> kPageCommands = {"state", "get",      "set",       "select",
                                             "click", "dblclick", "lostfocus", "call"};
const std::set<std::string> kPageCalls = {"ShowDoc"};

// The control's state, with the entries of its drop-down lists, which the
// page cannot know from the design alone (the document types are read from
// the company).
json PageState(const Card& card) {
    json state = StateJson::Build(card);
    json lists = json::object();
    for (const Control* control : card.controls())
        if (control->kind() == ControlKind::ComboBox) {
            const auto& list = static_cast<const ComboBox&>(*control);
            json entries = json::array();
            for (int32_t i = 0; i < list.ListCount(); ++i)
                entries.push_back(StateJson::Text(list.List(i)));
            lists[list.name()] = std::move(entries);
        }
    state["lists"] = std::move(lists);
    return state;
}

std::string ReadFile(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), {});
}

} // namespace

WebSession::WebSession(Options options, std::unique_ptr<PageLink> link, PrintStore& prints)
    : options_(std::move(options)), link_(std::move(link)), prints_(prints), id_(gNextId++) {
    thread_ = std::thread([this] { run(); });
}

WebSession::~WebSession() {
    gone();
    if (thread_.joinable())
        thread_.join();
    prints_.dropOwner(id_);
}

void WebSession::deliver(std::string message) {
    {
        std::lock_guard lock(mutex_);
        inbox_.push_back(std::move(message));
    }
    arrived_.notify_one();
}

void WebSession::gone() {
    {
        std::lock_guard lock(mutex_);
        gone_ = true;
    }
    arrived_.notify_one();
}

void WebSession::run() {
    FileReach::Limit(options_.roots);
    try {
        ModuleState state;
        HostSession::Setup setup;
        setup.messages = this;
        setup.forms = this;
        setup.elements = options_.elements;
        auto settings =
            options_.settings ? options_.settings() : std::make_unique<MemorySettingsStore>();
        HostSession host(std::move(settings), state, setup);
        start(host);
        while (std::optional<json> message = next())
            dispatch(*message);
        progressWatch_.disconnect();
    } catch (const std::exception& e) {
        progressWatch_.disconnect();
        std::cerr << "dovrel serve: a session failed: " << TerminalText(ErrorText(e)) << std::endl;
    }
    host_ = nullptr;
    ended_ = true;
    link_->close();
}

void WebSession::start(HostSession& host) {
    host_ = &host;
    static const json design = DesignJson::Build();
    send({{"type", "hello"}, {"design", design}, {"state", PageState(host.card())}});
    // The card lives as long as the session: requests that make cards are
    // not the page's to send.
    progressWatch_ = host.card().ProgressFill.changed.connect([this] { progress(); });
}

std::optional<json> WebSession::next() {
    for (;;) {
        std::string text;
        {
            std::unique_lock lock(mutex_);
            arrived_.wait(lock, [this] { return gone_ || !inbox_.empty(); });
            if (gone_)
                return std::nullopt;
            text = std::move(inbox_.front());
            inbox_.pop_front();
        }
        json message = json::parse(text, nullptr, false);
        if (message.is_object() && message.value("type", "") != "")
            return message;
        send({{"type", "reply"},
              {"ok", false},
              {"error", "A message is a JSON object with a type"}});
    }
}

void WebSession::dispatch(const json& message) {
    if (message["type"] == "request")
        request(message);
    // An answer or a close with nothing shown is late: the box is gone.
}

void WebSession::refuse(const json& message, const std::string& why) {
    send({{"type", "reply"}, {"id", message.value("id", json())}, {"ok", false}, {"error", why}});
}

void WebSession::request(const json& message) {
    const json& request = message.value("request", json());
    if (!request.is_array() || request.empty() || !request[0].is_string() ||
        !kPageCommands.count(request[0].get<std::string>()))
        return refuse(message, "A page may not send that request");
    if (request[0] == "call" && (request.size() < 2 || !request[1].is_string() ||
                                 !kPageCalls.count(request[1].get<std::string>())))
        return refuse(message, "A page may not call that member");
    // While a form is shown only its own controls take the user's actions.
    if (!formsShown_.empty() && request[0] != "state" && request[0] != "get") {
        std::string prefix = formsShown_.back() + ".";
        if (request.size() < 2 || !request[1].is_string() ||
            !request[1].get<std::string>().starts_with(prefix))
            return refuse(message, "A form is shown");
    }
    json reply = json::parse(host_->handle(request.dump()));
    if (reply.contains("state"))
        reply["state"] = PageState(host_->card());
    sendPrints(reply);
    reply["type"] = "reply";
    reply["id"] = message.value("id", json());
    send(reply);
    sendClipboard();
}

void WebSession::sendPrints(json& reply) {
    if (!reply.contains("opened"))
        return;
    for (const json& path : reply["opened"]) {
        std::string name = prints_.add(id_, ReadFile(path.get<std::string>()));
        send({{"type", "print"}, {"url", "/print/" + name}});
    }
    reply.erase("opened");
}

void WebSession::sendClipboard() {
    std::string text = host_->clipboard().GetText();
    if (text == clipboard_)
        return;
    clipboard_ = text;
    send({{"type", "clipboard"}, {"text", StateJson::Text(text)}});
}

void WebSession::progress() {
    const Card& card = host_->card();
    auto now = std::chrono::steady_clock::now();
    int32_t fill = card.ProgressFill.Width();
    // The first and the last step always go: the bar starts and ends right.
    bool edge = fill == 0 || fill >= card.ProgressFrame.Width();
    if (!edge && now - lastProgress_ < std::chrono::milliseconds(kProgressEveryMs))
        return;
    lastProgress_ = now;
    send({{"type", "progress"}, {"frame", card.ProgressFrame.Width()}, {"fill", fill}});
}

void WebSession::send(const json& message) {
    link_->send(StateJson::Dump(message));
}

MsgAnswer WebSession::show(MsgIcon icon, MsgButtons buttons, const Utf8& title, const Utf8& text) {
    // The close button of an OK box is OK; a question's is No, the answer
    // that changes nothing.
    MsgAnswer closed = buttons == MsgButtons::Ok ? MsgAnswer::Ok : MsgAnswer::No;
    json shown = StateJson::Messages({{icon, buttons, title, text}})[0];
    shown["type"] = "message";
    send(shown);
    while (std::optional<json> message = next()) {
        if ((*message)["type"] == "answer") {
            std::string answer = message->value("answer", "");
            if (buttons == MsgButtons::Ok)
                return MsgAnswer::Ok;
            if (answer == "yes" || answer == "no")
                return answer == "yes" ? MsgAnswer::Yes : MsgAnswer::No;
        } else if ((*message)["type"] == "request") {
            refuse(*message, "A message box is shown");
        }
    }
    return closed;
}

void WebSession::ShowModal(Form& form) {
    form.Show();
    formsShown_.push_back(form.name());
    send({{"type", "form"}, {"name", form.name()}, {"state", PageState(host_->card())}});
    while (form.Visible()) {
        std::optional<json> message = next();
        if (!message) {
            form.QueryClose();
            break;
        }
        if ((*message)["type"] == "close")
            form.QueryClose();
        else
            dispatch(*message);
    }
    form.Hide();
    formsShown_.pop_back();
    send({{"type", "formClosed"}, {"name", form.name()}});
}

} // namespace dovrel
