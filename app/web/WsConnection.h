#pragma once

#include "app/web/WebSession.h"
#include "app/web/WebSite.h"

#include <boost/beast/core.hpp>
#include <boost/beast/websocket.hpp>

#include <deque>
#include <memory>
#include <string>

namespace dovrel {

class WebServer;

// One page's WebSocket: its messages go to the page's session, the
// session's messages come back in order. A message over the size limit, a
// page silent past the idle time, or a page that cannot keep up closes it,
// which ends the session.
template <class Stream>
class WsConnection : public std::enable_shared_from_this<WsConnection<Stream>> {
public:
    WsConnection(Stream stream, WebServer& server, std::string peer);
    void start(WebSite::Request request);

    // On the server's thread.
    void queue(std::string message);
    void shut();

    // Messages waiting for a page that does not read them.
    static constexpr size_t kQueueLimit = 4096;

private:
    void onAccept(boost::beast::error_code ec);
    void read();
    void onRead(boost::beast::error_code ec);
    void write();
    void end();

    boost::beast::websocket::stream<Stream> ws_;
    WebServer& server_;
    std::string peer_;
    WebSite::Request request_;
    boost::beast::flat_buffer buffer_;
    std::deque<std::string> out_;
    std::shared_ptr<WebSession> session_;
    bool closing_ = false;
    bool ended_ = false;
    bool closeSent_ = false;
};

} // namespace dovrel
