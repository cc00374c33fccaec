#pragma once

#include "platform/SettingsStore.h"

#include <chrono>
#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace dovrel {

// How `dovrel serve` serves: the folders pages may reach, where it listens,
// who may come in and how much each may ask.
struct ServeOptions {
    std::vector<std::string> roots;
    std::string host = "127.0.0.1";
    unsigned short port = 8080;
    // Empty: no token (only allowed on a loopback address).
    std::string token;
    // HTTPS with this certificate chain and private key (PEM files), or
    // plain HTTP when both are empty.
    std::string tlsCert;
    std::string tlsKey;
    // Origins that may show the viewer in a frame; none by default.
    std::vector<std::string> embedOrigins;
    size_t maxSessions = 32;
    std::chrono::seconds idle{30 * 60};
    // How long a client may take to send a request or a message.
    std::chrono::seconds slowClient{30};
    size_t headerLimit = 8 * 1024;
    size_t bodyLimit = 64 * 1024;
    size_t messageLimit = 64 * 1024;
    // The settings each page's control reads and saves; the user's store
    // when not given.
    std::function<std::unique_ptr<SettingsStore>()> settings;
};

} // namespace dovrel
