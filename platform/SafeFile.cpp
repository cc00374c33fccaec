#include "platform/SafeFile.h"

#include "platform/Ascii.h"
#include "platform/Error.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace dovrel {

namespace {

[[noreturn]] void Fail(const std::string& what, const Path& path, const std::string& why) {
    throw Error("Cannot " + what + " " + path.shown().str() + ": " + why);
}

[[noreturn]] void FailErrno(const std::string& what, const Path& path) {
    Fail(what, path, std::strerror(errno));
}

std::string FolderOf(const Path& file) {
    const std::string& path = file.native();
    size_t slash = path.find_last_of('/');
    if (slash == std::string::npos)
        return ".";
    return slash == 0 ? "/" : path.substr(0, slash);
}

const char* KindOf(mode_t mode) {
    if (S_ISDIR(mode))
        return "it is a folder, not a regular file";
    if (S_ISFIFO(mode))
        return "it is a pipe, not a regular file";
    if (S_ISCHR(mode) || S_ISBLK(mode))
        return "it is a device, not a regular file";
    return "it is not a regular file";
}

void WriteAll(int fd, std::string_view bytes, const std::string& what, const Path& path) {
    size_t done = 0;
    while (done < bytes.size()) {
        ssize_t n = ::write(fd, bytes.data() + done, bytes.size() - done);
        if (n < 0 && errno == EINTR)
            continue;
        if (n < 0)
            FailErrno(what, path);
        done += static_cast<size_t>(n);
    }
}

} // namespace

bool IsAccountingFile(std::string_view path) {
    if (path.size() < 4)
        return false;
    return EqualsNoCase(path.substr(path.size() - 4), ".fix");
}

void CheckWriteTarget(const Path& path, const std::string& what) {
    std::string doing = "write " + what;
    if (path.empty())
        Fail(doing, path, "no file name was given");
    if (IsAccountingFile(path.native()))
        Fail(doing, path, "it is one of the accounting system's files, which Dovrel never writes");
    struct stat info {};
    if (::lstat(path.c_str(), &info) != 0) {
        if (errno == ENOENT)
            return;
        FailErrno(doing, path);
    }
    if (!S_ISREG(info.st_mode) && !S_ISLNK(info.st_mode))
        Fail(doing, path, KindOf(info.st_mode));
}

void WriteFileAtomically(const Path& path, std::string_view bytes, const std::string& what) {
    CheckWriteTarget(path, what);
    std::string doing = "write " + what;
    std::string temp = FolderOf(path) + "/.dovrel-XXXXXX";
    int fd = ::mkstemp(temp.data()); // mode 0600
    if (fd < 0)
        FailErrno(doing, path);
    try {
        WriteAll(fd, bytes, doing, path);
        if (::fsync(fd) != 0)
            FailErrno(doing, path);
        int closed = ::close(fd);
        fd = -1;
        if (closed != 0)
            FailErrno(doing, path);
        if (::rename(temp.c_str(), path.c_str()) != 0)
            FailErrno(doing, path);
    } catch (...) {
        if (fd >= 0)
            ::close(fd);
        ::unlink(temp.c_str());
        throw;
    }
}

void CheckReadSource(const Path& path, size_t limit, const std::string& what) {
    std::string doing = "read " + what;
    struct stat info {};
    if (::stat(path.c_str(), &info) != 0)
        FailErrno(doing, path);
    if (!S_ISREG(info.st_mode))
        Fail(doing, path, KindOf(info.st_mode));
    if (static_cast<uint64_t>(info.st_size) > limit)
        Fail(doing, path,
             "it is larger than " + std::to_string(limit / 1024) + " KiB, too large for " + what);
}

std::string ReadWholeFile(const Path& path, size_t limit, const std::string& what) {
    std::string doing = "read " + what;
    int fd = ::open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
    if (fd < 0)
        FailErrno(doing, path);
    std::string bytes;
    try {
        struct stat info {};
        if (::fstat(fd, &info) != 0)
            FailErrno(doing, path);
        if (!S_ISREG(info.st_mode))
            Fail(doing, path, KindOf(info.st_mode));
        char buffer[65536];
        for (ssize_t n; (n = ::read(fd, buffer, sizeof buffer)) != 0;) {
            if (n < 0 && errno == EINTR)
                continue;
            if (n < 0)
                FailErrno(doing, path);
            bytes.append(buffer, static_cast<size_t>(n));
            if (bytes.size() > limit)
                Fail(doing, path,
                     "it is larger than " + std::to_string(limit / 1024) + " KiB, too large for " +
                         what);
        }
    } catch (...) {
        ::close(fd);
        throw;
    }
    ::close(fd);
    return bytes;
}

std::string JoinFolder(const std::string& folder, const std::string& name) {
    if (folder.empty() || folder.back() == '/' || folder.back() == '\\')
        return folder + name;
    return folder + (folder.find('/') != std::string::npos ? '/' : '\\') + name;
}

} // namespace dovrel
