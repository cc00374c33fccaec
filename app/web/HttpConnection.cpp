#include "app/web/HttpConnection.h"

#include "app/web/WebServer.h"
#include "app/web/WsConnection.h"

#include <boost/beast/websocket.hpp>
#include <boost/beast/websocket/ssl.hpp>

namespace dovrel {
namespace {

namespace beast = boost::beast;
namespace http = beast::http;

std::string PathOf(const WebSite::Request& request) {
    std::string_view target = request.target();
    return std::string(target.substr(0, target.find('?')));
}

std::string PeerOf(const boost::asio::ip::tcp::socket& socket) {
    boost::system::error_code ec;
    auto remote = socket.remote_endpoint(ec);
    return ec ? "?" : remote.address().to_string();
}

} // namespace

template <class Stream>
HttpConnection<Stream>::HttpConnection(Stream stream, WebServer& server)
    : stream_(std::move(stream)), server_(server) {
    peer_ = PeerOf(beast::get_lowest_layer(stream_).socket());
}

template <class Stream> void HttpConnection<Stream>::start() {
    if constexpr (std::is_same_v<Stream, TlsStream>) {
        beast::get_lowest_layer(stream_).expires_after(server_.options().slowClient);
        stream_.async_handshake(boost::asio::ssl::stream_base::server,
                                [self = this->shared_from_this()](beast::error_code ec) {
                                    if (ec)
                                        return self->shutdown();
                                    self->read();
                                });
    } else {
        read();
    }
}

template <class Stream> void HttpConnection<Stream>::shutdown() {
    beast::error_code ec;
    beast::get_lowest_layer(stream_).socket().shutdown(boost::asio::ip::tcp::socket::shutdown_both,
                                                       ec);
}

template <class Stream> void HttpConnection<Stream>::read() {
    parser_.emplace();
    parser_->header_limit(static_cast<uint32_t>(server_.options().headerLimit));
    parser_->body_limit(server_.options().bodyLimit);
    buffer_.clear();
    beast::get_lowest_layer(stream_).expires_after(server_.options().slowClient);
    http::async_read(
        stream_, buffer_, *parser_,
        [self = this->shared_from_this()](beast::error_code ec, size_t) { self->onRead(ec); });
}

template <class Stream> void HttpConnection<Stream>::onRead(beast::error_code ec) {
    if (ec == http::error::header_limit || ec == http::error::body_limit ||
        ec == http::error::buffer_overflow) {
        WebServer::Log("refused a request too large from " + peer_);
        WebSite::Request request;
        request.version(11);
        request.keep_alive(false);
        return reply(server_.site().tooLarge(request));
    }
    if (ec) {
        if (ec == beast::error::timeout)
            WebServer::Log("dropped a client too slow from " + peer_);
        return shutdown();
    }
    WebSite::Request request = parser_->release();
    if (beast::websocket::is_upgrade(request)) {
        if (std::optional<WebSite::Response> refusal = server_.site().refuseUpgrade(request)) {
            refuse(request, refusal->result_int());
            refusal->keep_alive(false);
            return reply(std::move(*refusal));
        }
        beast::get_lowest_layer(stream_).expires_never();
        std::make_shared<WsConnection<Stream>>(std::move(stream_), server_, peer_)
            ->start(std::move(request));
        return;
    }
    WebSite::Response response = server_.site().respond(request);
    if (response.result_int() >= 400)
        refuse(request, response.result_int());
    reply(std::move(response));
}

template <class Stream>
void HttpConnection<Stream>::refuse(const WebSite::Request& request, unsigned status) {
    WebServer::Log("refused " + std::to_string(status) + " " +
                   std::string(request.method_string()) + " " + PathOf(request) + " from " + peer_);
}

template <class Stream> void HttpConnection<Stream>::reply(WebSite::Response response) {
    bool close = !response.keep_alive();
    response_ = std::move(response);
    beast::get_lowest_layer(stream_).expires_after(server_.options().slowClient);
    http::async_write(stream_, *response_,
                      [self = this->shared_from_this(), close](beast::error_code ec, size_t) {
                          self->onWrite(close, ec);
                      });
}

template <class Stream> void HttpConnection<Stream>::onWrite(bool close, beast::error_code ec) {
    response_.reset();
    if (ec || close) {
        return shutdown();
    }
    read();
}

template class HttpConnection<PlainStream>;
template class HttpConnection<TlsStream>;

} // namespace dovrel
