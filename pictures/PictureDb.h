#pragma once

#include "platform/Path.h"

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace dovrel {

class Messages;

// One row of the picture table: a range of item keys and category codes and
// its picture file. A missing value is Null (an open bound); texts are code
// page 1255.
struct PictureRange {
    int32_t RangeID = 0;
    std::optional<std::string> FromItemKey;
    std::optional<std::string> ToItemKey;
    std::optional<std::string> FromCatCode;
    std::optional<std::string> ToCatCode;
    std::optional<std::string> PicFile;

    bool operator==(const PictureRange&) const = default;
};

// The picture database "Dovrel.def": an SQLite file with the one table
// tItemPicture. Each call opens the file, works in one transaction and closes
// it again, so other programs may use the file between calls; a call that
// finds the file locked waits up to the busy timeout and then fails. Every
// failure is an Error naming the file; a failed change leaves the file as it
// was. Paths are code page 1255, with "\" or "/" as separators.
class PictureDb {
public:
    static constexpr const char* kFileName = "Dovrel.def";
    // Field sizes in characters: item keys, category codes, picture file.
    static constexpr size_t kKeySize = 12, kCodeSize = 3, kPicFileSize = 50;
    // The most ranges the picture settings form can list; more are refused.
    static constexpr size_t kMaxRanges = 32767;
    // A database of that many ranges of the longest texts is far below this.
    static constexpr size_t kMaxFileSize = 64 * 1024 * 1024;

    enum class FileKind { Missing, Pictures, Foreign };
    struct Inspection {
        FileKind kind = FileKind::Missing;
        std::string reason; // why a foreign file is not a picture database
    };

    // The database file by its native name, or by a name of the control's
    // kind (code page 1255 text).
    explicit PictureDb(Path file) : file_(std::move(file)) {}
    explicit PictureDb(const std::string& cp1255) : PictureDb(PathFromCp1255(cp1255)) {}
    const Path& file() const { return file_; }
    void setBusyTimeout(std::chrono::milliseconds timeout) { busyTimeout_ = timeout; }

    // Whether the file is missing, a picture database, or something else.
    Inspection inspect() const;
    // Makes a new, empty picture database. It is built beside the file and put
    // in its place only when complete; a failure leaves the old file as it was.
    // A file that is not a picture database is replaced only when replaceForeign.
    void create(bool replaceForeign) const;

    // The ranges by RangeID (the settings form's order).
    std::vector<PictureRange> rangesById() const;
    // The ranges by FromItemKey, then FromCatCode, Null first (the lookup's order).
    std::vector<PictureRange> rangesInLookupOrder() const;

    // Stores the ranges as RangeID 1, 2 ... n and deletes every higher number,
    // in one transaction; the given RangeIDs are ignored. A range that the
    // table refuses (see problemOf) fails the whole call, naming its position.
    void replaceAll(const std::vector<PictureRange>& ranges) const;
    // Adds one range under the next free number; returns that number.
    int32_t add(PictureRange range) const;
    // Deletes one range; false when there was none of that number.
    bool remove(int32_t rangeId) const;

    // What the table refuses in a range, in plain words, or "" when nothing:
    // an empty text (only Null may stand for no value) or a text longer than its field.
    static std::string problemOf(const PictureRange& range);

private:
    std::vector<PictureRange> query(const char* sql) const;

    Path file_;
    std::chrono::milliseconds busyTimeout_{5000};
};

// Makes a new, empty picture database at the path (PictureDb::create) and
// returns the path; on failure shows the failure's description under the title
// "תקלה" and returns "". A file there that is not a picture database is
// replaced only when replaceForeign.
std::string CreatePicDB(const std::string& path, Messages& messages, bool replaceForeign = false);

} // namespace dovrel
