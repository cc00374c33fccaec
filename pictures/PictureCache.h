#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include <sys/types.h>

namespace dovrel {

class PictureLookup;

// The picture ranges of the last database read, ready for the lookup. Reading
// and preparing them costs far more than a page's lines, so they are kept in
// memory (never the file) for as long as the file is unchanged. The module
// state holds one; it is not shared between threads.
class PictureCache {
public:
    // The lookup of the database dbName, read afresh when the file changed.
    std::shared_ptr<const PictureLookup> lookupOf(const std::string& dbName);

    // What tells one state of a database file from another: the file itself and
    // SQLite's change counter, which every committed change of a file in
    // rollback-journal mode raises. Files in other modes are never taken as unchanged.
    struct FileState {
        dev_t device = 0;
        ino_t inode = 0;
        off_t size = 0;
        int64_t modifiedNs = 0;
        std::string counter;

        bool operator==(const FileState&) const = default;
    };

private:
    std::string fsPath_;
    FileState state_;
    std::shared_ptr<const PictureLookup> lookup_;
};

} // namespace dovrel
