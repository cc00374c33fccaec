#include "app/web/WebServer.h"

#include "app/web/HttpConnection.h"
#include "platform/Error.h"
#include "platform/FileReach.h"

#include <boost/asio/signal_set.hpp>
#include <boost/asio/strand.hpp>

#include <filesystem>
#include <iostream>

namespace dovrel {
namespace {

namespace net = boost::asio;
using tcp = net::ip::tcp;

std::mutex gLogMutex;

ServeOptions Checked(ServeOptions options) {
    if (options.roots.empty())
        throw Error("Give at least one folder to serve with --root");
    for (std::string& root : options.roots) {
        std::error_code ec;
        if (!std::filesystem::is_directory(root, ec))
            throw Error("Not a folder: " + root);
        root = FileReach::Real(root);
    }
    if (options.tlsCert.empty() != options.tlsKey.empty())
        throw Error("HTTPS needs both --tls-cert and --tls-key");
    if (options.maxSessions == 0)
        throw Error("--max-sessions must be at least 1");
    boost::system::error_code ec;
    net::ip::address address = net::ip::make_address(options.host, ec);
    if (ec)
        throw Error("Not an address to listen on: " + options.host);
    if (!address.is_loopback() && options.token.empty())
        throw Error("Listening on " + options.host +
                    ", which other machines reach, needs a token: give --token-file");
    return options;
}

} // namespace

WebServer::WebServer(ServeOptions options)
    : options_(Checked(std::move(options))),
      site_(options_, prints_, [this] { return openSessions(); }), acceptor_(context_) {
    if (!options_.tlsCert.empty())
        loadCertificate();
    tcp::endpoint endpoint(net::ip::make_address(options_.host), options_.port);
    boost::system::error_code ec;
    acceptor_.open(endpoint.protocol(), ec);
    if (!ec)
        acceptor_.set_option(net::socket_base::reuse_address(true), ec);
    if (!ec)
        acceptor_.bind(endpoint, ec);
    if (!ec)
        acceptor_.listen(net::socket_base::max_listen_connections, ec);
    if (ec)
        throw Error("Cannot listen on " + options_.host + ":" + std::to_string(options_.port) +
                    ": " + ec.message());
    port_ = acceptor_.local_endpoint().port();
}

void WebServer::loadCertificate() {
    tls_.emplace(net::ssl::context::tls_server);
    tls_->set_options(net::ssl::context::default_workarounds | net::ssl::context::no_sslv2 |
                      net::ssl::context::no_sslv3 | net::ssl::context::no_tlsv1 |
                      net::ssl::context::no_tlsv1_1);
    boost::system::error_code ec;
    tls_->use_certificate_chain_file(options_.tlsCert, ec);
    if (ec)
        throw Error("Cannot read the certificate " + options_.tlsCert + ": " + ec.message());
    tls_->use_private_key_file(options_.tlsKey, net::ssl::context::pem, ec);
    if (ec)
        throw Error("Cannot read the private key " + options_.tlsKey + ": " + ec.message());
}

WebServer::~WebServer() {
    stop();
}

std::string WebServer::url() const {
    bool v6 = options_.host.find(':') != std::string::npos;
    std::string host = v6 ? "[" + options_.host + "]" : options_.host;
    std::string url =
        std::string(tls_ ? "https://" : "http://") + host + ":" + std::to_string(port_) + "/";
    if (!options_.token.empty())
        url += "?token=" + options_.token;
    return url;
}

void WebServer::Log(const std::string& line) {
    std::lock_guard lock(gLogMutex);
    std::cerr << "dovrel serve: " << line << std::endl;
}

size_t WebServer::openSessions() {
    std::lock_guard lock(sessionsMutex_);
    std::erase_if(sessions_, [](const auto& session) { return session->ended(); });
    return sessions_.size();
}

std::shared_ptr<WebSession>
WebServer::openSession(const std::map<std::string, std::string>& elements,
                       std::unique_ptr<PageLink> link) {
    WebSession::Options options;
    options.roots = options_.roots;
    options.settings = options_.settings;
    for (const auto& [id, value] : elements)
        options.elements[id] = value;
    auto session = std::make_shared<WebSession>(std::move(options), std::move(link), prints_);
    std::lock_guard lock(sessionsMutex_);
    sessions_.push_back(session);
    return session;
}

void WebServer::accept() {
    acceptor_.async_accept(net::make_strand(context_), [this](boost::system::error_code ec,
                                                              tcp::socket socket) {
        if (ec)
            return;
        if (tls_)
            std::make_shared<HttpConnection<TlsStream>>(TlsStream(std::move(socket), *tls_), *this)
                ->start();
        else
            std::make_shared<HttpConnection<PlainStream>>(PlainStream(std::move(socket)), *this)
                ->start();
        accept();
    });
}

void WebServer::run(bool stopOnSignals) {
    net::signal_set signals(context_);
    if (stopOnSignals) {
        signals.add(SIGINT);
        signals.add(SIGTERM);
        signals.async_wait([this](boost::system::error_code ec, int) {
            if (!ec)
                stop();
        });
    }
    accept();
    context_.run();
    std::vector<std::shared_ptr<WebSession>> ending;
    {
        std::lock_guard lock(sessionsMutex_);
        ending.swap(sessions_);
    }
    for (const auto& session : ending)
        session->gone();
    ending.clear();
}

void WebServer::stop() {
    context_.stop();
}

} // namespace dovrel
