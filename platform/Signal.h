#pragma once

#include "platform/Connection.h"

#include <algorithm>
#include <cstddef>
#include <functional>
#include <memory>
#include <utility>
#include <vector>

namespace dovrel {

// A minimal observer list: models announce their changes through it, and
// views (the Qt widgets, the automation host) listen. Listeners are called in
// the order they connected, on the caller's thread. Each listener stays for
// as long as its Connection is kept. A listener may connect or disconnect
// others, or itself, while the signal is being raised: one removed is not
// called again, one added is first called by the next raising.
template <typename... Args> class Signal {
public:
    using Slot = std::function<void(Args...)>;

    Signal() = default;
    // A copy starts without listeners; a moved signal takes its listeners along.
    Signal(const Signal&) {}
    Signal& operator=(const Signal&) { return *this; }
    Signal(Signal&& other) : state_(std::exchange(other.state_, std::make_shared<State>())) {}
    Signal& operator=(Signal&& other) {
        std::swap(state_, other.state_);
        return *this;
    }

    [[nodiscard]] Connection connect(Slot slot) {
        auto entry = std::make_shared<Entry>(Entry{std::move(slot), true});
        state_->entries.push_back(entry);
        return Connection(
            [state = std::weak_ptr<State>(state_), entry = std::weak_ptr<Entry>(entry)] {
                if (auto kept = state.lock())
                    kept->remove(entry.lock());
            });
    }

    void operator()(Args... args) const {
        // Held here, so that a listener may even destroy the signal.
        std::shared_ptr<State> state = state_;
        Raising raising(*state);
        for (size_t i = 0, n = state->entries.size(); i < n; ++i) {
            std::shared_ptr<Entry> entry = state->entries[i];
            if (entry->live)
                entry->slot(args...);
        }
    }

    bool empty() const { return slotCount() == 0; }
    // The listeners connected now.
    size_t slotCount() const {
        return static_cast<size_t>(std::count_if(state_->entries.begin(), state_->entries.end(),
                                                 [](const auto& entry) { return entry->live; }));
    }

private:
    struct Entry {
        Slot slot;
        bool live;
    };
    struct State {
        std::vector<std::shared_ptr<Entry>> entries;
        int raising = 0;

        // While the signal is raised the entry is only marked: the list is
        // walked by position, and the slot may be running.
        void remove(const std::shared_ptr<Entry>& entry) {
            if (!entry)
                return;
            entry->live = false;
            if (raising == 0)
                purge();
        }
        void purge() {
            std::erase_if(entries, [](const auto& entry) { return !entry->live; });
        }
    };
    struct Raising {
        explicit Raising(State& raised) : state(raised) { ++state.raising; }
        ~Raising() {
            if (--state.raising == 0)
                state.purge();
        }
        State& state;
    };

    std::shared_ptr<State> state_ = std::make_shared<State>();
};

} // namespace dovrel
