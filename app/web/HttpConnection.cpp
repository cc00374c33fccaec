#include "app/web/HttpConnection.h"

#include "app/web/WebServer.h"
#include "app/web/WsConnection.h"

#include <boost/beast/websocket.hpp>

namespace dovrel {
namespace {

namespace beast = boost::beast;
namespace http = beast::http;

std::string PathOf(const WebSite::Request& request) {
    std::string_view target = request.target();
    return std::string(target.substr(0, target.find('?')));
}

} // namespace

HttpConnection::HttpConnection(boost::asio::ip::tcp::socket socket, WebServer& server)
    : stream_(std::move(socket)), server_(server) {
    boost::system::error_code ec;
    auto remote = stream_.socket().remote_endpoint(ec);
    peer_ = ec ? "?" : remote.address().to_string();
}

void HttpConnection::read() {
    parser_.emplace();
    parser_->header_limit(static_cast<uint32_t>(server_.options().headerLimit));
    parser_->body_limit(server_.options().bodyLimit);
    buffer_.clear();
    stream_.expires_after(server_.options().slowClient);
    http::async_read(
        stream_, buffer_, *parser_,
        [self = shared_from_this()](beast::error_code ec, size_t) { self->onRead(ec); });
}

void HttpConnection::onRead(beast::error_code ec) {
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
        stream_.socket().shutdown(boost::asio::ip::tcp::socket::shutdown_both, ec);
        return;
    }
    WebSite::Request request = parser_->release();
    if (beast::websocket::is_upgrade(request)) {
        if (std::optional<WebSite::Response> refusal = server_.site().refuseUpgrade(request)) {
            refuse(request, refusal->result_int());
            refusal->keep_alive(false);
            return reply(std::move(*refusal));
        }
        stream_.expires_never();
        std::make_shared<WsConnection>(std::move(stream_), server_, peer_)
            ->start(std::move(request));
        return;
    }
    WebSite::Response response = server_.site().respond(request);
    if (response.result_int() >= 400)
        refuse(request, response.result_int());
    reply(std::move(response));
}

void HttpConnection::refuse(const WebSite::Request& request, unsigned status) {
    WebServer::Log("refused " + std::to_string(status) + " " +
                   std::string(request.method_string()) + " " + PathOf(request) + " from " + peer_);
}

void HttpConnection::reply(WebSite::Response response) {
    bool close = !response.keep_alive();
    response_ = std::move(response);
    stream_.expires_after(server_.options().slowClient);
    http::async_write(stream_, *response_,
                      [self = shared_from_this(), close](beast::error_code ec, size_t) {
                          self->onWrite(close, ec);
                      });
}

void HttpConnection::onWrite(bool close, beast::error_code ec) {
    response_.reset();
    if (ec || close) {
        stream_.socket().shutdown(boost::asio::ip::tcp::socket::shutdown_send, ec);
        return;
    }
    read();
}

} // namespace dovrel
