#include "pictures/PictureCache.h"

#include "pictures/PictureDb.h"
#include "pictures/PictureLookup.h"
#include "platform/FileSystem.h"

#include <optional>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace dovrel {

namespace {

std::optional<PictureCache::FileState> StateOf(const std::string& fsPath) {
    int fd = open(fsPath.c_str(), O_RDONLY | O_CLOEXEC);
    if (fd < 0)
        return std::nullopt;
    struct stat info {};
    unsigned char head[28] = {};
    bool read = fstat(fd, &info) == 0 && pread(fd, head, sizeof head, 0) == sizeof head;
    close(fd);
    if (!read || head[18] != 1 || head[19] != 1)
        return std::nullopt;
    return PictureCache::FileState{info.st_dev, info.st_ino, info.st_size,
                                   int64_t{info.st_mtim.tv_sec} * 1000000000 + info.st_mtim.tv_nsec,
                                   std::string(reinterpret_cast<const char*>(head + 24), 4)};
}

} // namespace

std::shared_ptr<const PictureLookup> PictureCache::lookupOf(const std::string& dbName) {
    std::string fsPath = ResolvePath(PathFromCp1255(dbName)).native();
    std::optional<FileState> before = StateOf(fsPath);
    if (before && lookup_ && fsPath_ == fsPath && state_ == *before)
        return lookup_;
    auto lookup = std::make_shared<const PictureLookup>(PictureDb(dbName).rangesInLookupOrder());
    std::optional<FileState> after = StateOf(fsPath);
    if (before && after && *before == *after) {
        fsPath_ = fsPath;
        state_ = *after;
        lookup_ = lookup;
    } else {
        fsPath_.clear();
        state_ = {};
        lookup_.reset();
    }
    return lookup;
}

} // namespace dovrel
