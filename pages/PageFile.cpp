#include "pages/PageFile.h"

#include "platform/Error.h"
#include "platform/SafeFile.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace dovrel {

namespace {

std::string Cause() {
    return std::strerror(errno);
}

} // namespace

void PageFile::commit() const {
    WriteFileAtomically(path_, text_, "the page");
}

Path PrivatePageDir() {
    const char* tmp = std::getenv("TMPDIR");
    std::string base = tmp != nullptr && tmp[0] == '/' ? tmp : "/tmp";
    std::string dir = base + "/dovrel-" + std::to_string(::getuid());
    if (::mkdir(dir.c_str(), 0700) != 0 && errno != EEXIST)
        throw Error("Could not make the page folder " + Path(dir).shown().str() + ": " + Cause());
    struct stat st {};
    if (::lstat(dir.c_str(), &st) != 0)
        throw Error("Could not use the page folder " + Path(dir).shown().str() + ": " + Cause());
    if (!S_ISDIR(st.st_mode) || st.st_uid != ::getuid())
        throw Error("The page folder " + Path(dir).shown().str() +
                    " is not a folder of this user's own");
    if ((st.st_mode & 077) != 0 && ::chmod(dir.c_str(), 0700) != 0)
        throw Error("The page folder " + Path(dir).shown().str() + " is open to other users");
    return Path(dir);
}

Path PrintFilePath() {
    return Path(PrivatePageDir().native() + "/dvprint.htm");
}

} // namespace dovrel
