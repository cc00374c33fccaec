#pragma once

#include <functional>
#include <utility>
#include <vector>

namespace dovrel {

// A minimal observer list: models announce their changes through it, and
// views (the Qt widgets, the automation host) listen. Listeners are called in
// the order they connected, on the caller's thread.
template <typename... Args> class Signal {
public:
    using Slot = std::function<void(Args...)>;

    void connect(Slot slot) { slots_.push_back(std::move(slot)); }
    void operator()(Args... args) const {
        for (const auto& slot : slots_)
            slot(args...);
    }
    bool empty() const { return slots_.empty(); }

private:
    std::vector<Slot> slots_;
};

} // namespace dovrel
