#include "platform/FileSystem.h"

#include "platform/Encoding.h"

#include <sys/stat.h>

#include <algorithm>
#include <filesystem>
#include <vector>

namespace dovrel {
namespace {

bool SameNoCase(std::string_view a, std::string_view b) {
    return std::equal(a.begin(), a.end(), b.begin(), b.end(), [](char x, char y) {
        auto lower = [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c; };
        return lower(x) == lower(y);
    });
}

bool Exists(const std::string& path) {
    struct stat st;
    return ::lstat(path.c_str(), &st) == 0;
}

// The entry of dir whose name equals name without regard to case, the
// first in sorted order when there are several; empty when there is none.
std::string MatchInDirectory(const std::string& dir, const std::string& name) {
    std::vector<std::string> matches;
    std::error_code ec;
    std::filesystem::directory_iterator it(dir.empty() ? "." : dir, ec);
    for (; !ec && it != std::filesystem::directory_iterator(); it.increment(ec)) {
        std::string entry = it->path().filename().string();
        if (SameNoCase(entry, name))
            matches.push_back(entry);
    }
    if (matches.empty())
        return {};
    return *std::min_element(matches.begin(), matches.end());
}

} // namespace

std::string ResolvePath(std::string_view path) {
    std::string native = ToUtf8(path);
    std::replace(native.begin(), native.end(), '\\', '/');
    std::string resolved = native.starts_with('/') ? "/" : "";
    bool matching = true;  // stays true while every component so far exists
    size_t pos = 0;
    while (pos <= native.size()) {
        size_t slash = native.find('/', pos);
        if (slash == std::string::npos)
            slash = native.size();
        std::string component = native.substr(pos, slash - pos);
        pos = slash + 1;
        if (component.empty())
            continue;
        std::string parent = resolved;
        if (!resolved.empty() && resolved.back() != '/')
            resolved += '/';
        if (matching && !Exists(resolved + component)) {
            std::string match = MatchInDirectory(parent, component);
            if (match.empty())
                matching = false;
            else
                component = match;
        }
        resolved += component;
    }
    return resolved;
}

bool FileExists(std::string_view path) {
    struct stat st;
    std::string resolved = ResolvePath(path);
    return !resolved.empty() && ::stat(resolved.c_str(), &st) == 0 && S_ISREG(st.st_mode);
}

} // namespace dovrel
