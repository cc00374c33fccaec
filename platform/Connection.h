#pragma once

#include <functional>
#include <utility>

namespace dovrel {

// A listener's hold on a signal: the listener stays connected for as long as
// the connection is kept, and is removed when the connection is dropped or
// disconnected. A connection moves with its owner and is never copied; it may
// outlive its signal.
class Connection {
public:
    Connection() = default;
    explicit Connection(std::function<void()> disconnect) : disconnect_(std::move(disconnect)) {}
    Connection(Connection&& other) noexcept : disconnect_(std::exchange(other.disconnect_, {})) {}
    Connection& operator=(Connection&& other) noexcept {
        if (this != &other) {
            disconnect();
            disconnect_ = std::exchange(other.disconnect_, {});
        }
        return *this;
    }
    Connection(const Connection&) = delete;
    Connection& operator=(const Connection&) = delete;
    ~Connection() { disconnect(); }

    void disconnect() {
        if (auto disconnect = std::exchange(disconnect_, {}))
            disconnect();
    }

private:
    std::function<void()> disconnect_;
};

} // namespace dovrel
