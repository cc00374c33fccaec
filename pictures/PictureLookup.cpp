#include "pictures/PictureLookup.h"

#include "platform/Ascii.h"

#include "fixfiles/CurrentDocument.h"
#include "pictures/PictureCollation.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

#include <algorithm>
#include <memory>
#include <optional>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace dovrel {

namespace {

// The order of two sort keys: their heads first, their bytes when the heads
// are equal. Sort keys hold no zero bytes, so a head padded with zeros keeps
// a shorter key first.
int Compare(const PictureLookup::SortKey& a, const PictureLookup::SortKey& b) {
    if (a.head != b.head)
        return a.head < b.head ? -1 : 1;
    return a.bytes.compare(b.bytes);
}

// Whether the value lies within the bounds; a Null bound leaves its end open.
bool Within(const PictureLookup::SortKey& value, const PictureLookup::SortKey& from,
            const PictureLookup::SortKey& to) {
    return (from.null || Compare(value, from) >= 0) && (to.null || Compare(value, to) <= 0);
}

} // namespace

PictureLookup::SortKey PictureLookup::sortKeyOf(const std::optional<std::string>& text) {
    SortKey key;
    if (!text)
        return key;
    key.bytes = PictureCollation::instance().sortKey(*text);
    key.null = false;
    for (size_t i = 0; i < 8; ++i)
        key.head = key.head << 8 | (i < key.bytes.size() ? static_cast<uint8_t>(key.bytes[i]) : 0);
    return key;
}

PictureLookup::PictureLookup(std::vector<PictureRange> ranges) : ranges_(std::move(ranges)) {
    keys_.reserve(ranges_.size());
    for (const PictureRange& range : ranges_)
        keys_.push_back({sortKeyOf(range.FromItemKey), sortKeyOf(range.ToItemKey),
                         sortKeyOf(range.FromCatCode), sortKeyOf(range.ToCatCode)});
}

bool PictureLookup::contains(size_t range, const SortKey& key, const SortKey& code) const {
    const Keys& k = keys_[range];
    return Within(key, k.fromKey, k.toKey) && Within(code, k.fromCode, k.toCode);
}

const std::string* PictureLookup::pictureFor(std::string_view itemKey,
                                             std::string_view catCode) const {
    if (Trim(catCode).empty() || ranges_.empty())
        return nullptr;
    SortKey key = sortKeyOf(std::string(Trim(itemKey)));
    SortKey code = sortKeyOf(std::string(catCode));
    for (size_t i = ranges_.size(); i-- > 0;) {
        if (!contains(i, key, code))
            continue;
        if (!ranges_[i].PicFile)
            throw Error("The picture range " + std::to_string(ranges_[i].RangeID) +
                        " has no picture file");
        return &*ranges_[i].PicFile;
    }
    return nullptr;
}

namespace {

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

std::optional<FileState> StateOf(const std::string& fsPath) {
    int fd = open(fsPath.c_str(), O_RDONLY | O_CLOEXEC);
    if (fd < 0)
        return std::nullopt;
    struct stat info {};
    unsigned char head[28] = {};
    bool read = fstat(fd, &info) == 0 && pread(fd, head, sizeof head, 0) == sizeof head;
    close(fd);
    if (!read || head[18] != 1 || head[19] != 1)
        return std::nullopt;
    return FileState{info.st_dev, info.st_ino, info.st_size,
                     int64_t{info.st_mtim.tv_sec} * 1000000000 + info.st_mtim.tv_nsec,
                     std::string(reinterpret_cast<const char*>(head + 24), 4)};
}

// The ranges of the database as the lookup needs them. Reading and preparing
// them costs far more than a page's lines, so the last database read on this
// thread is kept in memory (never the file) for as long as the file is unchanged.
std::shared_ptr<const PictureLookup> LookupOf(const std::string& dbName) {
    struct Kept {
        std::string fsPath;
        FileState state;
        std::shared_ptr<const PictureLookup> lookup;
    };
    thread_local Kept kept;
    std::string fsPath = ResolvePath(PathFromCp1255(dbName)).native();
    std::optional<FileState> before = StateOf(fsPath);
    if (before && kept.lookup && kept.fsPath == fsPath && kept.state == *before)
        return kept.lookup;
    auto lookup = std::make_shared<const PictureLookup>(PictureDb(dbName).rangesInLookupOrder());
    std::optional<FileState> after = StateOf(fsPath);
    if (before && after && *before == *after)
        kept = {fsPath, *after, lookup};
    else
        kept = {};
    return lookup;
}

} // namespace

void FillPictures(const std::string& dbName, CurrentDocument& doc) {
    if (!FileExists(PathFromCp1255(dbName)))
        return;
    std::shared_ptr<const PictureLookup> found = LookupOf(dbName);
    const PictureLookup& lookup = *found;
    int count = std::clamp<int>(doc.lineCount, 0, kMaxDocLines);
    for (int i = 1; i <= count; ++i) {
        DocumentLine& line = doc.lines[static_cast<size_t>(i)];
        if (const std::string* picture = lookup.pictureFor(line.itemKey, line.catCode)) {
            line.picFile = picture->substr(0, PictureDb::kPicFileSize);
            line.picFile.resize(PictureDb::kPicFileSize, ' ');
        }
    }
}

} // namespace dovrel
