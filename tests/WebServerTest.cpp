#include "app/web/WebServer.h"
#include "TestCompany.h"
#include "platform/Error.h"

#include <boost/asio/connect.hpp>
#include <boost/asio/ip/tcp.hpp>
#include <boost/asio/ssl.hpp>
#include <boost/beast/core.hpp>
#include <boost/beast/http.hpp>
#include <boost/beast/ssl.hpp>
#include <boost/beast/websocket.hpp>
#include <boost/beast/websocket/ssl.hpp>
#include <gtest/gtest.h>
#include <openssl/pem.h>
#include <openssl/x509.h>

#include <filesystem>
#include <fstream>
#include <thread>

namespace dovrel {
namespace {

namespace beast = boost::beast;
namespace http = beast::http;
namespace websocket = beast::websocket;
namespace net = boost::asio;
using tcp = net::ip::tcp;
namespace fs = std::filesystem;

// A server on a free loopback port, run on a thread of the test.
class Running {
public:
    explicit Running(ServeOptions options) : server(std::move(options)) {
        thread_ = std::thread([this] { server.run(); });
    }
    ~Running() {
        server.stop();
        thread_.join();
    }
    WebServer server;

private:
    std::thread thread_;
};

// A small client: one request on its own connection, with a time limit.
class Client {
public:
    explicit Client(unsigned short port) : port_(port) {}

    http::response<http::string_body> get(const std::string& target,
                                          const std::string& cookie = "") {
        beast::tcp_stream stream(context_);
        stream.expires_after(std::chrono::seconds(20));
        stream.connect(tcp::endpoint(net::ip::make_address("127.0.0.1"), port_));
        http::request<http::empty_body> request(http::verb::get, target, 11);
        request.set(http::field::host, host());
        if (!cookie.empty())
            request.set(http::field::cookie, cookie);
        http::write(stream, request);
        beast::flat_buffer buffer;
        http::response<http::string_body> response;
        http::read(stream, buffer, response);
        return response;
    }

    // A page's WebSocket, opened with that Origin; throws when refused.
    std::unique_ptr<websocket::stream<beast::tcp_stream>> socket(const std::string& origin) {
        auto ws = std::make_unique<websocket::stream<beast::tcp_stream>>(context_);
        beast::get_lowest_layer(*ws).expires_after(std::chrono::seconds(20));
        beast::get_lowest_layer(*ws).connect(
            tcp::endpoint(net::ip::make_address("127.0.0.1"), port_));
        ws->set_option(
            websocket::stream_base::decorator([origin](websocket::request_type& request) {
                request.set(http::field::origin, origin);
            }));
        websocket::response_type response;
        ws->handshake(response, host(), "/ws");
        return ws;
    }
    std::string host() const { return "127.0.0.1:" + std::to_string(port_); }

private:
    net::io_context context_;
    unsigned short port_;
};

ServeOptions Options(const fs::path& root) {
    ServeOptions options;
    options.roots = {root.string()};
    options.port = 0;
    return options;
}

TEST(WebServerTest, AddressesOutsideTheRootsAndGuessedPrintsAreNotFound) {
    test::TempDir temp;
    fs::path root = temp.path() / "root", outside = temp.path() / "outside";
    fs::create_directories(root / "pics");
    fs::create_directories(outside);
    std::ofstream(root / "pics" / "a.jpg") << "jpeg";
    std::ofstream(root / "pics" / "notes.txt") << "text";
    std::ofstream(outside / "secret.jpg") << "secret";
    fs::create_directory_symlink(outside, root / "out");
    Running running(Options(root));
    Client client(running.server.port());

    http::response<http::string_body> page = client.get("/?AccountKey=1001");
    EXPECT_EQ(page.result_int(), 200);
    EXPECT_EQ(page["X-Content-Type-Options"], "nosniff");
    EXPECT_NE(std::string(page["Content-Security-Policy"]).find("frame-ancestors 'none'"),
              std::string::npos);

    http::response<http::string_body> picture = client.get((root / "pics" / "a.jpg").string());
    EXPECT_EQ(picture.result_int(), 200);
    EXPECT_EQ(picture.body(), "jpeg");
    EXPECT_EQ(picture[http::field::content_type], "image/jpeg");
    std::string r = root.string();
    for (const std::string& refused :
         {r + "/pics/notes.txt", r + "/../outside/secret.jpg", r + "/%2e%2e/outside/secret.jpg",
          r + "/%2E%2E%2Foutside%2Fsecret.jpg", r + "/out/secret.jpg",
          (outside / "secret.jpg").string(), std::string("/etc/passwd"), r + "/pics",
          std::string("/print/0123456789abcdef0123456789abcdef"), std::string("/print/")})
        EXPECT_EQ(client.get(refused).result_int(), 404) << refused;
}

TEST(WebServerTest, TheTokenIsNeededOffLoopbackAndOnceGivenIsACookie) {
    test::TempDir root;
    ServeOptions open = Options(root.path());
    open.host = "0.0.0.0";
    EXPECT_THROW(WebServer{open}, Error);

    ServeOptions options = Options(root.path());
    options.token = "s3cret-token-0123456789";
    Running running(options);
    Client client(running.server.port());
    EXPECT_EQ(client.get("/").result_int(), 401);
    EXPECT_EQ(client.get("/?token=wrong-token-0123456789").result_int(), 401);
    EXPECT_EQ(client.get("/", "dovrel_token=wrong").result_int(), 401);
    http::response<http::string_body> first = client.get("/?token=s3cret-token-0123456789");
    ASSERT_EQ(first.result_int(), 200);
    std::string cookie(first[http::field::set_cookie]);
    EXPECT_NE(cookie.find("HttpOnly"), std::string::npos);
    EXPECT_NE(cookie.find("SameSite=Strict"), std::string::npos);
    EXPECT_EQ(client.get("/viewer.js", cookie.substr(0, cookie.find(';'))).result_int(), 200);
    // The WebSocket without the cookie is refused as well.
    EXPECT_THROW(client.socket("http://" + client.host()), boost::system::system_error);
}

TEST(WebServerTest, ForeignOriginsOversizedMessagesAndOnePageTooManyAreRefused) {
    test::TempDir root;
    Running running(Options(root.path()));
    Client client(running.server.port());
    std::string own = "http://" + client.host();
    EXPECT_THROW(client.socket("http://evil.example"), boost::system::system_error);
    EXPECT_THROW(client.socket(""), boost::system::system_error);

    auto big = client.socket(own);
    beast::flat_buffer hello;
    big->read(hello);
    std::string message(running.server.options().messageLimit + 1, 'x');
    beast::error_code ec;
    big->write(net::buffer(message), ec);
    beast::flat_buffer rest;
    while (!ec)
        big->read(rest, ec);
    EXPECT_NE(ec, beast::error::timeout) << "the socket was closed by the server";

    std::vector<std::unique_ptr<websocket::stream<beast::tcp_stream>>> pages;
    for (size_t i = 0; i < running.server.options().maxSessions; ++i) {
        pages.push_back(client.socket(own));
        beast::flat_buffer buffer;
        pages.back()->read(buffer);
    }
    EXPECT_EQ(client.get("/").result_int(), 503);
    EXPECT_THROW(client.socket(own), boost::system::system_error);
    pages.back()->close(websocket::close_code::normal);
    pages.pop_back();
    // The closed page's place is free again once its session has ended.
    int status = 503;
    for (int i = 0; i < 200 && status == 503; ++i) {
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
        status = client.get("/").result_int();
    }
    EXPECT_EQ(status, 200);
}

// A self-signed certificate for 127.0.0.1, written as PEM files.
void WriteCertificate(const fs::path& cert, const fs::path& key) {
    EVP_PKEY* pkey = EVP_EC_gen("P-256");
    X509* x509 = X509_new();
    ASN1_INTEGER_set(X509_get_serialNumber(x509), 1);
    X509_gmtime_adj(X509_getm_notBefore(x509), 0);
    X509_gmtime_adj(X509_getm_notAfter(x509), 3600);
    X509_set_pubkey(x509, pkey);
    X509_NAME* name = X509_get_subject_name(x509);
    X509_NAME_add_entry_by_txt(name, "CN", MBSTRING_ASC,
                               reinterpret_cast<const unsigned char*>("127.0.0.1"), -1, -1, 0);
    X509_set_issuer_name(x509, name);
    X509_sign(x509, pkey, EVP_sha256());
    FILE* out = std::fopen(cert.c_str(), "w");
    PEM_write_X509(out, x509);
    std::fclose(out);
    out = std::fopen(key.c_str(), "w");
    PEM_write_PrivateKey(out, pkey, nullptr, nullptr, 0, nullptr, nullptr);
    std::fclose(out);
    X509_free(x509);
    EVP_PKEY_free(pkey);
}

TEST(WebServerTest, HttpsServesThePageAndItsWebSocket) {
    test::TempDir root;
    ServeOptions options = Options(root.path());
    options.tlsCert = (root.path() / "cert.pem").string();
    options.tlsKey = (root.path() / "key.pem").string();
    ServeOptions missing = options;
    EXPECT_THROW(WebServer{missing}, Error) << "the files are not there yet";
    WriteCertificate(options.tlsCert, options.tlsKey);
    Running running(options);
    EXPECT_EQ(running.server.url().substr(0, 8), "https://");

    net::io_context context;
    net::ssl::context tls(net::ssl::context::tls_client);
    tls.set_verify_mode(net::ssl::verify_none);
    std::string host = "127.0.0.1:" + std::to_string(running.server.port());
    tcp::endpoint endpoint(net::ip::make_address("127.0.0.1"), running.server.port());

    beast::ssl_stream<beast::tcp_stream> stream(context, tls);
    beast::get_lowest_layer(stream).expires_after(std::chrono::seconds(20));
    beast::get_lowest_layer(stream).connect(endpoint);
    stream.handshake(net::ssl::stream_base::client);
    http::request<http::empty_body> request(http::verb::get, "/", 11);
    request.set(http::field::host, host);
    http::write(stream, request);
    beast::flat_buffer buffer;
    http::response<http::string_body> response;
    http::read(stream, buffer, response);
    EXPECT_EQ(response.result_int(), 200);

    websocket::stream<beast::ssl_stream<beast::tcp_stream>> ws(context, tls);
    beast::get_lowest_layer(ws).expires_after(std::chrono::seconds(20));
    beast::get_lowest_layer(ws).connect(endpoint);
    ws.next_layer().handshake(net::ssl::stream_base::client);
    ws.set_option(websocket::stream_base::decorator([host](websocket::request_type& upgrade) {
        upgrade.set(http::field::origin, "https://" + host);
    }));
    ws.handshake(host, "/ws");
    beast::flat_buffer hello;
    ws.read(hello);
    EXPECT_NE(beast::buffers_to_string(hello.data()).find("\"hello\""), std::string::npos);
}

} // namespace
} // namespace dovrel
