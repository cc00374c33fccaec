#include "platform/PathNames.h"

#include "platform/Encoding.h"

#include <algorithm>

namespace dovrel {
namespace {

constexpr size_t kMaxKept = 64;

bool IsSeparator(char c) {
    return c == '\\' || c == '/';
}

// True when prefix is the whole of text or a run of whole components of it.
bool LeadsTo(std::string_view text, std::string_view prefix) {
    return !prefix.empty() && text.starts_with(prefix) &&
           (text.size() == prefix.size() || IsSeparator(prefix.back()) ||
            IsSeparator(text[prefix.size()]));
}

} // namespace

std::string PathNames::text(const Path& path) {
    std::string cp1255 = FromUtf8(Utf8(path.native()));
    if (ToUtf8(cp1255).str() == path.native())
        return cp1255;
    std::erase_if(kept_, [&](const auto& entry) { return entry.first == cp1255; });
    if (kept_.size() == kMaxKept)
        kept_.erase(kept_.begin());
    kept_.emplace_back(cp1255, path);
    return cp1255;
}

Path PathNames::native(std::string_view cp1255) const {
    const std::pair<std::string, Path>* best = nullptr;
    for (const auto& entry : kept_) {
        const std::string& shown = entry.first;
        if (LeadsTo(cp1255, shown) && (best == nullptr || shown.size() > best->first.size()))
            best = &entry;
    }
    if (best == nullptr)
        return PathFromCp1255(cp1255);
    return best->second.plus(cp1255.substr(best->first.size()));
}

} // namespace dovrel
