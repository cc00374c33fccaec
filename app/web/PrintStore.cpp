#include "app/web/PrintStore.h"

#include "platform/Error.h"

#include <sys/random.h>

#include <array>
#include <cerrno>

namespace dovrel {

std::string PrintStore::RandomName() {
    std::array<unsigned char, 16> bytes{};
    size_t got = 0;
    while (got < bytes.size()) {
        ssize_t n = getrandom(bytes.data() + got, bytes.size() - got, 0);
        if (n < 0 && errno != EINTR)
            throw Error("The system's random source cannot be read");
        if (n > 0)
            got += static_cast<size_t>(n);
    }
    static constexpr char kHex[] = "0123456789abcdef";
    std::string name;
    for (unsigned char byte : bytes) {
        name += kHex[byte >> 4];
        name += kHex[byte & 15];
    }
    return name;
}

std::string PrintStore::add(uint64_t owner, std::string page) {
    std::string name = RandomName();
    std::lock_guard lock(mutex_);
    size_t count = 0;
    auto oldest = pages_.end();
    for (auto it = pages_.begin(); it != pages_.end(); ++it)
        if (it->second.owner == owner) {
            ++count;
            if (oldest == pages_.end() || it->second.serial < oldest->second.serial)
                oldest = it;
        }
    if (count >= kPerOwner)
        pages_.erase(oldest);
    pages_[name] = Entry{owner, ++serial_, std::move(page)};
    return name;
}

std::optional<std::string> PrintStore::find(const std::string& name) const {
    std::lock_guard lock(mutex_);
    auto found = pages_.find(name);
    if (found == pages_.end())
        return std::nullopt;
    return found->second.page;
}

void PrintStore::dropOwner(uint64_t owner) {
    std::lock_guard lock(mutex_);
    std::erase_if(pages_, [owner](const auto& entry) { return entry.second.owner == owner; });
}

} // namespace dovrel
