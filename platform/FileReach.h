#pragma once

#include <string>
#include <vector>

namespace dovrel {

// The folders the files of this thread may be read from. A web page's session
// names folders and files itself, so its thread is held to the folders the
// server was given; every other thread reaches everything. The folders are
// compared after links are followed, so a link out of one does not lead out.
class FileReach {
public:
    // Holds this thread to the given folders, or frees it with none. A folder
    // that does not exist is left out.
    static void Limit(const std::vector<std::string>& roots);
    // The folders this thread is held to, links followed; empty when free.
    static const std::vector<std::string>& Roots();
    // True when the thread is free or the path, links followed, lies in one
    // of its folders. A path that does not exist (yet) is judged by the
    // nearest folder above it that does.
    static bool Allows(const std::string& native);
    // True when the path, links followed, lies in one of the given folders.
    static bool Inside(const std::string& native, const std::vector<std::string>& roots);
    // The path with links followed, as far as it exists; the rest appended.
    static std::string Real(const std::string& native);
    // What a path the thread may not reach resolves to: a name that never
    // exists, so the control reports a missing file and opens nothing.
    static constexpr const char* kOutside = "/nonexistent/outside-the-served-folders";
};

} // namespace dovrel
