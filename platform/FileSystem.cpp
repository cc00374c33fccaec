#include "platform/FileSystem.h"

#include "platform/Ascii.h"
#include "platform/FileReach.h"

#include <dirent.h>
#include <sys/stat.h>

#include <algorithm>

namespace dovrel {
namespace {

bool Exists(const std::string& path) {
    struct stat st;
    return ::lstat(path.c_str(), &st) == 0;
}

// The entry of dir whose name equals name without regard to case, the
// first in sorted order when there are several; empty when there is none.
// Read with readdir: the directory may be large and this runs on every
// lookup of a name that is not there as written.
std::string MatchInDirectory(const std::string& dir, const std::string& name) {
    DIR* stream = ::opendir(dir.empty() ? "." : dir.c_str());
    if (stream == nullptr)
        return {};
    std::string best;
    while (const dirent* entry = ::readdir(stream)) {
        std::string_view entryName = entry->d_name;
        if (EqualsNoCase(entryName, name) && (best.empty() || entryName < best))
            best = entryName;
    }
    ::closedir(stream);
    return best;
}

} // namespace

Path ResolvePath(const Path& path) {
    std::string native = path.native();
    std::replace(native.begin(), native.end(), '\\', '/');
    std::string resolved = native.starts_with('/') ? "/" : "";
    bool matching = true; // stays true while every component so far exists
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
    if (!FileReach::Allows(resolved))
        return Path(FileReach::kOutside);
    return Path(resolved);
}

bool FileExists(const Path& path) {
    struct stat st;
    Path resolved = ResolvePath(path);
    return !resolved.empty() && ::stat(resolved.c_str(), &st) == 0 && S_ISREG(st.st_mode);
}

} // namespace dovrel
