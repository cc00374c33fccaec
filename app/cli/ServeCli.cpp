#include "app/cli/Subcommands.h"
#include "app/web/WebServer.h"
#include "platform/Error.h"
#include "platform/SettingsStore.h"

#include <fstream>
#include <iostream>
#include <iterator>
#include <memory>

namespace dovrel {
namespace {

struct ServeArgs {
    std::vector<std::string> roots;
    std::string listen = "127.0.0.1:8080";
    std::string tokenFile;
    std::string tlsCert;
    std::string tlsKey;
    std::vector<std::string> embedOrigins;
    size_t maxSessions = 32;
};

// The token is the file's first line, without spaces around it.
std::string ReadToken(const std::string& file) {
    std::ifstream in(file);
    std::string token;
    if (!in || !std::getline(in, token))
        throw Error("Cannot read the token file " + file);
    while (!token.empty() && std::isspace(static_cast<unsigned char>(token.back())))
        token.pop_back();
    while (!token.empty() && std::isspace(static_cast<unsigned char>(token.front())))
        token.erase(token.begin());
    if (token.size() < 16)
        throw Error("The token in " + file + " is shorter than 16 characters");
    for (char c : token)
        if (!std::isalnum(static_cast<unsigned char>(c)) && c != '-' && c != '_' && c != '.')
            throw Error("The token may hold only letters, digits, '-', '_' and '.'");
    return token;
}

ServeOptions Options(const ServeArgs& args) {
    ServeOptions options;
    options.roots = args.roots;
    size_t colon = args.listen.rfind(':');
    if (colon == std::string::npos)
        throw Error("--listen takes HOST:PORT");
    std::string host = args.listen.substr(0, colon);
    if (host.size() > 1 && host.front() == '[' && host.back() == ']')
        host = host.substr(1, host.size() - 2);
    options.host = host;
    std::string port = args.listen.substr(colon + 1);
    if (port.empty() || port.size() > 5 ||
        port.find_first_not_of("0123456789") != std::string::npos || std::stoul(port) > 65535)
        throw Error("--listen: not a port: " + port);
    options.port = static_cast<unsigned short>(std::stoul(port));
    if (!args.tokenFile.empty())
        options.token = ReadToken(args.tokenFile);
    options.tlsCert = args.tlsCert;
    options.tlsKey = args.tlsKey;
    options.embedOrigins = args.embedOrigins;
    options.maxSessions = args.maxSessions;
    options.settings = [] { return std::make_unique<SqliteSettingsStore>(); };
    return options;
}

} // namespace

void AddServe(CLI::App& app, Runner& run) {
    auto args = std::make_shared<ServeArgs>();
    CLI::App* serve = app.add_subcommand("serve", "Show the viewer in web pages to the office");
    serve->add_option("--root", args->roots, "A folder the pages may read (repeat for more)")
        ->required();
    serve->add_option("--listen", args->listen, "HOST:PORT to listen on (port 0: a free one)");
    serve->add_option("--token-file", args->tokenFile,
                      "File holding the token a browser must bring (needed off loopback)");
    serve->add_option("--tls-cert", args->tlsCert, "Serve HTTPS with this certificate chain (PEM)");
    serve->add_option("--tls-key", args->tlsKey, "The certificate's private key (PEM)");
    serve->add_option("--embed-origin", args->embedOrigins,
                      "An origin whose pages may show the viewer in a frame");
    serve->add_option("--max-sessions", args->maxSessions, "Most pages open at once")
        ->check(CLI::Range(1, 100000));
    serve->callback([args, &run] {
        run = [args] {
            WebServer server(Options(*args));
            std::cout << server.url() << std::endl;
            server.run(true);
            return 0;
        };
    });
}

} // namespace dovrel
