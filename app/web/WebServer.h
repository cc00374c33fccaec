#pragma once

#include "app/web/PrintStore.h"
#include "app/web/ServeOptions.h"
#include "app/web/WebSession.h"
#include "app/web/WebSite.h"

#include <boost/asio/io_context.hpp>
#include <boost/asio/ip/tcp.hpp>
#include <boost/asio/ssl/context.hpp>

#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

namespace dovrel {

// `dovrel serve`: HTTP/1.1 and WebSocket on one address, every open page a
// WebSession of its own. Runs on one thread; each page's control runs on
// its session's thread.
class WebServer {
public:
    // Checks the options and starts listening; an Error says what is wrong.
    explicit WebServer(ServeOptions options);
    ~WebServer();
    WebServer(const WebServer&) = delete;
    WebServer& operator=(const WebServer&) = delete;

    unsigned short port() const { return port_; }
    // The address to open, with the token when there is one.
    std::string url() const;
    // Serves until stop() or, when asked, SIGINT or SIGTERM; then ends every
    // page's session.
    void run(bool stopOnSignals = false);
    // From any thread.
    void stop();

    // For the connections, on the server's thread.
    const WebSite& site() const { return site_; }
    const ServeOptions& options() const { return options_; }
    size_t openSessions();
    std::shared_ptr<WebSession> openSession(const std::map<std::string, std::string>& elements,
                                            std::unique_ptr<PageLink> link);
    boost::asio::io_context& context() { return context_; }

    // One line on standard error, never with a document's contents.
    static void Log(const std::string& line);

private:
    void accept();
    void loadCertificate();

    ServeOptions options_;
    PrintStore prints_;
    WebSite site_;
    std::mutex sessionsMutex_;
    std::vector<std::shared_ptr<WebSession>> sessions_;
    std::optional<boost::asio::ssl::context> tls_;
    boost::asio::io_context context_{1};
    boost::asio::ip::tcp::acceptor acceptor_;
    unsigned short port_ = 0;
};

} // namespace dovrel
