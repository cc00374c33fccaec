#include "platform/FileReach.h"

#include <climits>
#include <cstdlib>
#include <memory>

namespace dovrel {
namespace {

thread_local std::vector<std::string> tRoots;

std::string RealExisting(const std::string& path) {
    std::unique_ptr<char, decltype(&std::free)> real(::realpath(path.c_str(), nullptr), &std::free);
    return real ? std::string(real.get()) : std::string();
}

} // namespace

void FileReach::Limit(const std::vector<std::string>& roots) {
    tRoots.clear();
    for (const std::string& root : roots) {
        std::string real = RealExisting(root);
        if (!real.empty())
            tRoots.push_back(real);
    }
}

const std::vector<std::string>& FileReach::Roots() {
    return tRoots;
}

std::string FileReach::Real(const std::string& native) {
    std::string path = native.empty() ? "." : native;
    std::string rest;
    // Walks up until a folder exists: a file still to be made inside a root
    // is judged by the root.
    for (;;) {
        std::string real = RealExisting(path);
        if (!real.empty())
            return rest.empty() ? real : (real == "/" ? "" : real) + "/" + rest;
        size_t slash = path.find_last_of('/');
        if (slash == std::string::npos) {
            real = RealExisting(".");
            std::string joined = path + (rest.empty() ? "" : "/" + rest);
            return real + "/" + joined;
        }
        std::string name = path.substr(slash + 1);
        // ".." above a missing folder cannot be judged without it.
        if (name == "..")
            return kOutside;
        if (!name.empty() && name != ".")
            rest = rest.empty() ? name : name + "/" + rest;
        path = slash == 0 ? "/" : path.substr(0, slash);
    }
}

bool FileReach::Inside(const std::string& native, const std::vector<std::string>& roots) {
    std::string real = Real(native);
    for (const std::string& root : roots) {
        if (real == root)
            return true;
        std::string prefix = root == "/" ? root : root + "/";
        if (real.starts_with(prefix))
            return true;
    }
    return false;
}

bool FileReach::Allows(const std::string& native) {
    return tRoots.empty() || Inside(native, tRoots);
}

} // namespace dovrel
