#include "app/web/WebSite.h"

#include "app/web/PageAssets.h"
#include "platform/FileReach.h"

#include <sys/stat.h>

#include <cctype>
#include <fstream>
#include <iterator>

namespace dovrel {
namespace {

namespace http = boost::beast::http;

constexpr size_t kPictureLimit = 64 * 1024 * 1024;
constexpr const char* kPolicy = "Content-Security-Policy";

const std::map<std::string, std::string> kPictureTypes = {
    {"jpg", "image/jpeg"}, {"jpeg", "image/jpeg"}, {"png", "image/png"},
    {"gif", "image/gif"},  {"bmp", "image/bmp"},   {"webp", "image/webp"}};

std::string TypeOf(std::string_view name) {
    if (name.ends_with(".html"))
        return "text/html; charset=utf-8";
    if (name.ends_with(".css"))
        return "text/css; charset=utf-8";
    return "text/javascript; charset=utf-8";
}

// Constant time, so the token cannot be found a byte at a time.
bool SameSecret(std::string_view a, std::string_view b) {
    if (a.size() != b.size())
        return false;
    unsigned char diff = 0;
    for (size_t i = 0; i < a.size(); ++i)
        diff |= static_cast<unsigned char>(a[i] ^ b[i]);
    return diff == 0;
}

std::string CookieValue(std::string_view header, std::string_view name) {
    size_t pos = 0;
    while (pos < header.size()) {
        size_t end = header.find(';', pos);
        std::string_view part = header.substr(pos, end - pos);
        while (part.starts_with(' '))
            part.remove_prefix(1);
        if (part.starts_with(name) && part.size() > name.size() && part[name.size()] == '=')
            return std::string(part.substr(name.size() + 1));
        if (end == std::string_view::npos)
            break;
        pos = end + 1;
    }
    return {};
}

} // namespace

WebSite::WebSite(const ServeOptions& options, PrintStore& prints,
                 std::function<size_t()> openSessions)
    : options_(options), prints_(prints), openSessions_(std::move(openSessions)) {}

std::string WebSite::Decode(std::string_view text, bool plusIsSpace) {
    std::string out;
    for (size_t i = 0; i < text.size(); ++i) {
        char c = text[i];
        if (c == '%' && i + 2 < text.size() &&
            std::isxdigit(static_cast<unsigned char>(text[i + 1])) &&
            std::isxdigit(static_cast<unsigned char>(text[i + 2]))) {
            out += static_cast<char>(std::stoi(std::string(text.substr(i + 1, 2)), nullptr, 16));
            i += 2;
        } else {
            out += c == '+' && plusIsSpace ? ' ' : c;
        }
    }
    return out;
}

std::map<std::string, std::string> WebSite::Query(std::string_view target) {
    std::map<std::string, std::string> query;
    size_t mark = target.find('?');
    if (mark == std::string_view::npos)
        return query;
    std::string_view rest = target.substr(mark + 1);
    while (!rest.empty()) {
        size_t amp = rest.find('&');
        std::string_view pair = rest.substr(0, amp);
        size_t eq = pair.find('=');
        std::string key = Decode(pair.substr(0, eq));
        std::string value = eq == std::string_view::npos ? "" : Decode(pair.substr(eq + 1));
        query.emplace(std::move(key), std::move(value));
        rest = amp == std::string_view::npos ? std::string_view() : rest.substr(amp + 1);
    }
    return query;
}

std::map<std::string, std::string> WebSite::Elements(const Request& request) {
    std::map<std::string, std::string> elements;
    for (const auto& [key, value] : Query(request.target()))
        if (key == "SettingID" || key == "AccountKey")
            elements[key] = value;
    return elements;
}

void WebSite::secure(http::fields& fields) const {
    fields.set("X-Content-Type-Options", "nosniff");
    fields.set("Referrer-Policy", "no-referrer");
    fields.set(http::field::cache_control, "no-store");
    std::string ancestors = "'none'";
    if (!options_.embedOrigins.empty()) {
        ancestors.clear();
        for (const std::string& origin : options_.embedOrigins)
            ancestors += (ancestors.empty() ? "" : " ") + origin;
    }
    // A page's own policy is added to by the answer that serves it.
    fields.set(kPolicy, "frame-ancestors " + ancestors);
}

bool WebSite::authorised(const Request& request, bool& setCookie) const {
    setCookie = false;
    if (options_.token.empty())
        return true;
    auto query = Query(request.target());
    auto given = query.find("token");
    if (given != query.end() && SameSecret(given->second, options_.token)) {
        setCookie = true;
        return true;
    }
    std::string cookie = CookieValue(request[http::field::cookie], kCookie);
    return SameSecret(cookie, options_.token);
}

WebSite::Response WebSite::plain(const Request& request, http::status status,
                                 const std::string& text) const {
    Response response(status, request.version());
    secure(response.base());
    response.set(http::field::content_type, "text/plain; charset=utf-8");
    response.body() = text + "\n";
    response.keep_alive(request.keep_alive());
    response.prepare_payload();
    return response;
}

WebSite::Response WebSite::respond(const Request& request) const {
    if (request.method() != http::verb::get && request.method() != http::verb::head)
        return plain(request, http::status::method_not_allowed, "Only GET is served");
    bool setCookie = false;
    if (!authorised(request, setCookie))
        return plain(request, http::status::unauthorized, "Open the address the server printed");
    std::string_view target = request.target();
    std::string_view path = target.substr(0, target.find('?'));
    Response response = file(request, path);
    if (setCookie)
        response.set(http::field::set_cookie, std::string(kCookie) + "=" + options_.token +
                                                  "; HttpOnly; SameSite=Strict; Path=/" +
                                                  (options_.tlsCert.empty() ? "" : "; Secure"));
    if (request.method() == http::verb::head)
        response.body().clear();
    return response;
}

WebSite::Response WebSite::file(const Request& request, std::string_view path) const {
    if (path == "/" || path == "/index.html") {
        if (openSessions_() >= options_.maxSessions)
            return plain(request, http::status::service_unavailable,
                         "Too many pages are open on this server; close one and try again.");
        return asset(request, "index.html");
    }
    if (path == "/viewer.css" || path == "/viewer.js")
        return asset(request, path.substr(1));
    if (path.starts_with("/print/"))
        return printed(request, path.substr(7));
    return picture(request, Decode(path, false));
}

WebSite::Response WebSite::asset(const Request& request, std::string_view name) const {
    const PageAsset* found = FindPageAsset(name);
    if (found == nullptr)
        return plain(request, http::status::not_found, "Not found");
    Response response(http::status::ok, request.version());
    secure(response.base());
    response.set(http::field::content_type, TypeOf(name));
    if (name == "index.html")
        response.set(kPolicy, std::string(response[kPolicy]) +
                                  "; default-src 'self'; img-src 'self' data:; style-src 'self'; "
                                  "connect-src 'self'; object-src 'none'; base-uri 'none'");
    response.body() = std::string(found->bytes);
    response.keep_alive(request.keep_alive());
    response.prepare_payload();
    return response;
}

WebSite::Response WebSite::printed(const Request& request, std::string_view name) const {
    std::optional<std::string> page = prints_.find(std::string(name));
    if (!page)
        return plain(request, http::status::not_found, "Not found");
    Response response(http::status::ok, request.version());
    secure(response.base());
    response.set(http::field::content_type, "text/html; charset=windows-1255");
    // The printed page runs no script; its pictures come from this server.
    response.set(kPolicy, std::string(response[kPolicy]) +
                              "; default-src 'none'; img-src 'self'; style-src 'unsafe-inline'");
    response.body() = std::move(*page);
    response.keep_alive(request.keep_alive());
    response.prepare_payload();
    return response;
}

// A picture of a printed page: its address is the file's own path, served
// when it resolves, links followed, to an image file inside a root.
WebSite::Response WebSite::picture(const Request& request, const std::string& path) const {
    auto notFound = [&] { return plain(request, http::status::not_found, "Not found"); };
    if (path.find('\0') != std::string::npos || !path.starts_with('/'))
        return notFound();
    std::string real = FileReach::Real(path);
    struct stat st;
    if (!FileReach::Inside(real, options_.roots) || ::stat(real.c_str(), &st) != 0 ||
        !S_ISREG(st.st_mode) || static_cast<size_t>(st.st_size) > kPictureLimit)
        return notFound();
    size_t dot = real.find_last_of("./");
    if (dot == std::string::npos || real[dot] != '.')
        return notFound();
    std::string extension = real.substr(dot + 1);
    for (char& c : extension)
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    auto type = kPictureTypes.find(extension);
    if (type == kPictureTypes.end())
        return notFound();
    std::ifstream in(real, std::ios::binary);
    std::string bytes(std::istreambuf_iterator<char>(in), {});
    if (!in.good() && !in.eof())
        return notFound();
    Response response(http::status::ok, request.version());
    secure(response.base());
    response.set(http::field::content_type, type->second);
    response.body() = std::move(bytes);
    response.keep_alive(request.keep_alive());
    response.prepare_payload();
    return response;
}

std::optional<WebSite::Response> WebSite::refuseUpgrade(const Request& request) const {
    bool setCookie = false;
    if (!authorised(request, setCookie) || setCookie)
        return plain(request, http::status::unauthorized, "Open the address the server printed");
    std::string origin(request[http::field::origin]);
    std::string host(request[http::field::host]);
    std::string scheme = options_.tlsCert.empty() ? "http://" : "https://";
    if (host.empty() || origin != scheme + host)
        return plain(request, http::status::forbidden, "The page comes from another site");
    std::string_view target = request.target();
    if (target.substr(0, target.find('?')) != "/ws")
        return plain(request, http::status::not_found, "Not found");
    if (openSessions_() >= options_.maxSessions)
        return plain(request, http::status::service_unavailable, "Too many pages are open");
    return std::nullopt;
}

} // namespace dovrel
