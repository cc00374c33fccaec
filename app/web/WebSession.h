#pragma once

#include "app/web/PageLink.h"
#include "app/web/PrintStore.h"
#include "platform/Connection.h"
#include "platform/Form.h"
#include "platform/Messages.h"
#include "platform/SettingsStore.h"

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <thread>
#include <vector>

#include <nlohmann/json.hpp>

namespace dovrel {

class HostSession;

// One open page: its own control and module state on its own thread, as each
// page of the original had its own control. The page's messages run on that
// thread in the order they came. A message box or a side form the control
// shows blocks the thread until the page answers it; a page that goes away
// answers as the box's or the form's close button would, and ends the
// session.
//
// From the page: {"type": "request", "id": N, "request": [...]} (a host
// request), {"type": "answer", "answer": "ok" | "yes" | "no"} and
// {"type": "close"} (the shown form's close button). To the page: "hello"
// (the design tables and the state), "reply", "message", "form",
// "formClosed", "progress", "print" and "clipboard".
class WebSession : public Messages, public FormPresenter {
public:
    struct Options {
        std::vector<std::string> roots;
        // The container's page elements ("SettingID", "AccountKey").
        nlohmann::json elements = nlohmann::json::object();
        std::function<std::unique_ptr<SettingsStore>()> settings;
    };

    WebSession(Options options, std::unique_ptr<PageLink> link, PrintStore& prints);
    // Tells the session its page is gone and waits for its thread.
    ~WebSession() override;
    WebSession(const WebSession&) = delete;
    WebSession& operator=(const WebSession&) = delete;

    // A message from the page; runs on the session's thread later.
    void deliver(std::string message);
    // The page is gone: what is shown is closed, then the session ends.
    void gone();
    bool ended() const { return ended_; }
    uint64_t id() const { return id_; }

    MsgAnswer show(MsgIcon icon, MsgButtons buttons, const Utf8& title, const Utf8& text) override;
    void ShowModal(Form& form) override;

    // The fewest milliseconds between two progress messages.
    static constexpr int kProgressEveryMs = 34;

private:
    void run();
    void start(HostSession& host);
    // The page's next message, or nothing once the page is gone.
    std::optional<nlohmann::json> next();
    void dispatch(const nlohmann::json& message);
    void request(const nlohmann::json& message);
    void refuse(const nlohmann::json& message, const std::string& why);
    void sendPrints(nlohmann::json& reply);
    void sendClipboard();
    void progress();
    void send(const nlohmann::json& message);

    Options options_;
    std::unique_ptr<PageLink> link_;
    PrintStore& prints_;
    uint64_t id_;
    HostSession* host_ = nullptr;
    std::vector<std::string> formsShown_;
    std::string clipboard_;
    std::chrono::steady_clock::time_point lastProgress_{};
    Connection progressWatch_;

    std::mutex mutex_;
    std::condition_variable arrived_;
    std::deque<std::string> inbox_;
    bool gone_ = false;
    std::atomic<bool> ended_ = false;
    std::thread thread_;
};

} // namespace dovrel
