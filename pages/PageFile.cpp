#include "pages/PageFile.h"

#include "platform/Error.h"

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

std::string DirectoryOf(const std::string& path) {
    size_t slash = path.find_last_of('/');
    if (slash == std::string::npos)
        return ".";
    return slash == 0 ? "/" : path.substr(0, slash);
}

void WriteAll(int fd, const std::string& text, const std::string& path) {
    size_t done = 0;
    while (done < text.size()) {
        ssize_t n = ::write(fd, text.data() + done, text.size() - done);
        if (n < 0 && errno == EINTR)
            continue;
        if (n < 0)
            throw Error("Could not write the page " + path + ": " + Cause());
        done += static_cast<size_t>(n);
    }
}

} // namespace

void PageFile::commit() const {
    if (path_.empty())
        throw Error("No page file name was given");
    std::string native = path_.native();
    std::string temp = DirectoryOf(native) + "/.dvprint-XXXXXX";
    int fd = ::mkstemp(temp.data());
    if (fd < 0)
        throw Error("Could not write the page " + path_.shown() + ": " + Cause());
    try {
        WriteAll(fd, text_, path_.shown());
        // mkstemp made the file with mode 0600, readable by this user alone.
        if (::close(fd) != 0) {
            fd = -1;
            throw Error("Could not write the page " + path_.shown() + ": " + Cause());
        }
        fd = -1;
        if (::rename(temp.c_str(), native.c_str()) != 0)
            throw Error("Could not write the page " + path_.shown() + ": " + Cause());
    } catch (...) {
        if (fd >= 0)
            ::close(fd);
        ::unlink(temp.c_str());
        throw;
    }
}

Path PrivatePageDir() {
    const char* tmp = std::getenv("TMPDIR");
    std::string base = tmp != nullptr && tmp[0] == '/' ? tmp : "/tmp";
    std::string dir = base + "/dovrel-" + std::to_string(::getuid());
    if (::mkdir(dir.c_str(), 0700) != 0 && errno != EEXIST)
        throw Error("Could not make the page folder " + Path(dir).shown() + ": " + Cause());
    struct stat st {};
    if (::lstat(dir.c_str(), &st) != 0)
        throw Error("Could not use the page folder " + Path(dir).shown() + ": " + Cause());
    if (!S_ISDIR(st.st_mode) || st.st_uid != ::getuid())
        throw Error("The page folder " + Path(dir).shown() + " is not a folder of this user's own");
    if ((st.st_mode & 077) != 0 && ::chmod(dir.c_str(), 0700) != 0)
        throw Error("The page folder " + Path(dir).shown() + " is open to other users");
    return Path(dir);
}

Path PrintFilePath() {
    return Path(PrivatePageDir().native() + "/dvprint.htm");
}

} // namespace dovrel
