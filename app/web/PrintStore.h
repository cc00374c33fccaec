#pragma once

#include <cstdint>
#include <map>
#include <mutex>
#include <optional>
#include <string>

namespace dovrel {

// The printed pages of the open pages' sessions, in memory, each under a
// name of 128 random bits so that no one can guess another page's print.
// A session keeps its last few; its pages go when it ends.
class PrintStore {
public:
    static constexpr size_t kPerOwner = 8;

    // Keeps the page and gives its name (32 hex digits).
    std::string add(uint64_t owner, std::string page);
    std::optional<std::string> find(const std::string& name) const;
    void dropOwner(uint64_t owner);

    // 32 hex digits from the system's random source.
    static std::string RandomName();

private:
    struct Entry {
        uint64_t owner;
        uint64_t serial;
        std::string page;
    };
    mutable std::mutex mutex_;
    std::map<std::string, Entry> pages_;
    uint64_t serial_ = 0;
};

} // namespace dovrel
