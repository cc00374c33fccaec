#include "app/web/WsConnection.h"

#include "app/web/HttpConnection.h"
#include "app/web/WebServer.h"

#include <boost/beast/websocket/ssl.hpp>

#include <boost/asio/post.hpp>

namespace dovrel {
namespace {

namespace beast = boost::beast;
namespace websocket = beast::websocket;
namespace net = boost::asio;

// The session's way to the page: posted to the server's thread, and dropped
// once the connection is gone.
template <class Connection> class SocketLink : public PageLink {
public:
    SocketLink(std::weak_ptr<Connection> connection, net::any_io_executor executor)
        : connection_(std::move(connection)), executor_(std::move(executor)) {}

    void send(std::string message) override {
        net::post(executor_, [connection = connection_, message = std::move(message)]() mutable {
            if (auto kept = connection.lock())
                kept->queue(std::move(message));
        });
    }
    void close() override {
        net::post(executor_, [connection = connection_] {
            if (auto kept = connection.lock())
                kept->shut();
        });
    }

private:
    std::weak_ptr<Connection> connection_;
    net::any_io_executor executor_;
};

} // namespace

template <class Stream>
WsConnection<Stream>::WsConnection(Stream stream, WebServer& server, std::string peer)
    : ws_(std::move(stream)), server_(server), peer_(std::move(peer)) {}

template <class Stream> void WsConnection<Stream>::start(WebSite::Request request) {
    request_ = std::move(request);
    websocket::stream_base::timeout timeout{};
    timeout.handshake_timeout = server_.options().slowClient;
    timeout.idle_timeout = server_.options().idle;
    timeout.keep_alive_pings = false;
    ws_.set_option(timeout);
    ws_.read_message_max(server_.options().messageLimit);
    const WebSite& site = server_.site();
    ws_.set_option(websocket::stream_base::decorator(
        [&site](websocket::response_type& response) { site.secure(response.base()); }));
    ws_.async_accept(
        request_, [self = this->shared_from_this()](beast::error_code ec) { self->onAccept(ec); });
}

template <class Stream> void WsConnection<Stream>::onAccept(beast::error_code ec) {
    if (ec)
        return;
    session_ = server_.openSession(
        WebSite::Elements(request_),
        std::make_unique<SocketLink<WsConnection>>(this->weak_from_this(), ws_.get_executor()));
    WebServer::Log("page opened from " + peer_);
    read();
}

template <class Stream> void WsConnection<Stream>::read() {
    ws_.async_read(buffer_, [self = this->shared_from_this()](beast::error_code ec, size_t) {
        self->onRead(ec);
    });
}

template <class Stream> void WsConnection<Stream>::onRead(beast::error_code ec) {
    if (ec) {
        if (ec == websocket::error::message_too_big)
            WebServer::Log("closed a page whose message was too large, from " + peer_);
        return end();
    }
    session_->deliver(beast::buffers_to_string(buffer_.data()));
    buffer_.consume(buffer_.size());
    read();
}

template <class Stream> void WsConnection<Stream>::end() {
    if (ended_)
        return;
    ended_ = true;
    if (session_)
        session_->gone();
    WebServer::Log("page closed from " + peer_);
}

template <class Stream> void WsConnection<Stream>::queue(std::string message) {
    if (closing_)
        return;
    if (out_.size() >= kQueueLimit) {
        WebServer::Log("dropped a page that does not read, from " + peer_);
        closing_ = true;
        beast::error_code ignored;
        beast::get_lowest_layer(ws_).socket().close(ignored);
        return;
    }
    out_.push_back(std::move(message));
    if (out_.size() == 1)
        write();
}

template <class Stream> void WsConnection<Stream>::write() {
    ws_.text(true);
    ws_.async_write(net::buffer(out_.front()),
                    [self = this->shared_from_this()](beast::error_code ec, size_t) {
                        if (ec)
                            return self->end();
                        self->out_.pop_front();
                        if (!self->out_.empty())
                            self->write();
                        else if (self->closing_)
                            self->shut();
                    });
}

template <class Stream> void WsConnection<Stream>::shut() {
    closing_ = true;
    if ((!out_.empty() && !ended_) || closeSent_)
        return; // closed once the queued messages are out
    closeSent_ = true;
    ws_.async_close(websocket::close_code::normal,
                    [self = this->shared_from_this()](beast::error_code) { self->end(); });
}

template class WsConnection<PlainStream>;
template class WsConnection<TlsStream>;

} // namespace dovrel
