#pragma once

#include "app/web/PrintStore.h"
#include "app/web/ServeOptions.h"

#include <boost/beast/http.hpp>

#include <functional>
#include <map>
#include <optional>
#include <string>
#include <string_view>

namespace dovrel {

// What the server answers to one HTTP request, without sockets: the page and
// its files, the printed pages, the pictures under the roots; the token, the
// WebSocket's origin and the headers every answer carries.
class WebSite {
public:
    using Request = boost::beast::http::request<boost::beast::http::string_body>;
    using Response = boost::beast::http::response<boost::beast::http::string_body>;

    static constexpr const char* kCookie = "dovrel_token";

    // openSessions counts the pages open now.
    WebSite(const ServeOptions& options, PrintStore& prints, std::function<size_t()> openSessions);

    Response respond(const Request& request) const;
    // The refusal of a WebSocket upgrade, or nothing when it may go on.
    std::optional<Response> refuseUpgrade(const Request& request) const;
    // 413, for a request over the size limits.
    Response tooLarge(const Request& request) const {
        return plain(request, boost::beast::http::status::payload_too_large, "Request too large");
    }
    // The page elements the upgrade's address gives ("SettingID", "AccountKey").
    static std::map<std::string, std::string> Elements(const Request& request);
    // The headers every answer carries; the WebSocket's handshake too.
    void secure(boost::beast::http::fields& fields) const;

    // Undoes %XX escapes; a query's "+" is a space, a path's is itself.
    static std::string Decode(std::string_view text, bool plusIsSpace = true);
    static std::map<std::string, std::string> Query(std::string_view target);

private:
    bool authorised(const Request& request, bool& setCookie) const;
    Response file(const Request& request, std::string_view path) const;
    Response asset(const Request& request, std::string_view name) const;
    Response printed(const Request& request, std::string_view name) const;
    Response picture(const Request& request, const std::string& path) const;
    Response plain(const Request& request, boost::beast::http::status status,
                   const std::string& text) const;

    const ServeOptions& options_;
    PrintStore& prints_;
    std::function<size_t()> openSessions_;
};

} // namespace dovrel
