#pragma once

#include "app/web/WebSite.h"

#include <boost/asio/ip/tcp.hpp>
#include <boost/asio/ssl/context.hpp>
#include <boost/beast/core.hpp>
#include <boost/beast/http.hpp>
#include <boost/beast/ssl/ssl_stream.hpp>

#include <memory>
#include <optional>
#include <string>

namespace dovrel {

class WebServer;

using PlainStream = boost::beast::tcp_stream;
using TlsStream = boost::beast::ssl_stream<boost::beast::tcp_stream>;

// One client's HTTP/1.1 connection, plain or over TLS: its requests one
// after another, each within the size limits and sent within the time limit;
// an upgrade to a WebSocket hands the connection to a WsConnection.
template <class Stream>
class HttpConnection : public std::enable_shared_from_this<HttpConnection<Stream>> {
public:
    HttpConnection(Stream stream, WebServer& server);
    void start();

private:
    void read();
    void onRead(boost::beast::error_code ec);
    void reply(WebSite::Response response);
    void onWrite(bool close, boost::beast::error_code ec);
    void refuse(const WebSite::Request& request, unsigned status);
    void shutdown();

    Stream stream_;
    WebServer& server_;
    std::string peer_;
    boost::beast::flat_buffer buffer_;
    std::optional<boost::beast::http::request_parser<boost::beast::http::string_body>> parser_;
    std::optional<WebSite::Response> response_;
};

} // namespace dovrel
