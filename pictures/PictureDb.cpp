#include "pictures/PictureDb.h"

#include "pictures/PictureCollation.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"
#include "platform/Messages.h"
#include "platform/SafeFile.h"
#include "platform/Sqlite.h"

#include <sqlite3.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <climits>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <memory>
#include <random>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace dovrel {

namespace {

// Null stands for no value and a text has at least one character and at most
// its field's size, so another program writing the file is held to the same
// rules as this one. The text columns sort in the pictures' own order.
const char* const kCreateTable =
    "CREATE TABLE tItemPicture ("
    " RangeID INTEGER NOT NULL PRIMARY KEY"
    "  CHECK (RangeID BETWEEN -2147483648 AND 2147483647),"
    " FromItemKey TEXT COLLATE HEBREW_NOCASE CHECK (FromItemKey IS NULL OR"
    "  (typeof(FromItemKey) = 'text' AND length(FromItemKey) BETWEEN 1 AND 12)),"
    " ToItemKey TEXT COLLATE HEBREW_NOCASE CHECK (ToItemKey IS NULL OR"
    "  (typeof(ToItemKey) = 'text' AND length(ToItemKey) BETWEEN 1 AND 12)),"
    " FromCatCode TEXT COLLATE HEBREW_NOCASE CHECK (FromCatCode IS NULL OR"
    "  (typeof(FromCatCode) = 'text' AND length(FromCatCode) BETWEEN 1 AND 3)),"
    " ToCatCode TEXT COLLATE HEBREW_NOCASE CHECK (ToCatCode IS NULL OR"
    "  (typeof(ToCatCode) = 'text' AND length(ToCatCode) BETWEEN 1 AND 3)),"
    " PicFile TEXT COLLATE HEBREW_NOCASE CHECK (PicFile IS NULL OR"
    "  (typeof(PicFile) = 'text' AND length(PicFile) BETWEEN 1 AND 50)))";

// The lookup reads the ranges in this order; keeping it in an index spares
// sorting them on every page. Writing the table therefore needs the order too.
const char* const kCreateIndex =
    "CREATE INDEX tItemPictureLookup ON tItemPicture (FromItemKey, FromCatCode)";

const std::array<const char*, 6> kColumnNames = {"RangeID",     "FromItemKey", "ToItemKey",
                                                 "FromCatCode", "ToCatCode",   "PicFile"};

struct FieldRule {
    const char* name;
    const char* meaning;
    std::optional<std::string> PictureRange::*field;
    size_t size;
};
const std::array<FieldRule, 5> kFieldRules = {{
    {"FromItemKey", "lowest item key", &PictureRange::FromItemKey, PictureDb::kKeySize},
    {"ToItemKey", "highest item key", &PictureRange::ToItemKey, PictureDb::kKeySize},
    {"FromCatCode", "lowest category code", &PictureRange::FromCatCode, PictureDb::kCodeSize},
    {"ToCatCode", "highest category code", &PictureRange::ToCatCode, PictureDb::kCodeSize},
    {"PicFile", "picture file", &PictureRange::PicFile, PictureDb::kPicFileSize},
}};

// A connection that knows the pictures' text order before it touches the
// table, as every connection writing it must.
class Connection : public SqliteConnection {
public:
    Connection(const std::string& fsPath, int flags, std::chrono::milliseconds timeout,
               std::string failure)
        : SqliteConnection(fsPath, flags, timeout, std::move(failure)) {
        try {
            PictureCollation::instance().registerWith(handle());
        } catch (const Error& e) {
            throw Error(this->failure() + ": " + e.what());
        }
    }
};

using Statement = SqliteStatement;

std::string SchemaProblem(Connection& db) {
    Statement info(db, "PRAGMA table_info(tItemPicture)");
    std::vector<std::string> names;
    while (info.step())
        names.push_back(info.text(1).value_or(""));
    if (names.empty())
        return "it has no table tItemPicture";
    if (!std::equal(names.begin(), names.end(), kColumnNames.begin(), kColumnNames.end()))
        return "its table tItemPicture does not have the six picture fields";
    return "";
}

// What SQLite's own check finds wrong with the file, or "".
std::string Damage(Connection& db) {
    Statement check(db, "PRAGMA quick_check(1)");
    std::string result = check.step() ? check.text(0).value_or("") : "";
    return result == "ok" ? "" : "it is damaged (" + ToUtf8(result).str() + ")";
}

PictureRange RangeAt(const Statement& row) {
    PictureRange range;
    range.RangeID = static_cast<int32_t>(row.integer(0));
    range.FromItemKey = row.text(1);
    range.ToItemKey = row.text(2);
    range.FromCatCode = row.text(3);
    range.ToCatCode = row.text(4);
    range.PicFile = row.text(5);
    return range;
}

void BindRange(Statement& insert, int32_t rangeId, const PictureRange& range) {
    insert.bind(1, rangeId);
    insert.bind(2, range.FromItemKey);
    insert.bind(3, range.ToItemKey);
    insert.bind(4, range.FromCatCode);
    insert.bind(5, range.ToCatCode);
    insert.bind(6, range.PicFile);
}

const char* const kUpsert =
    "INSERT INTO tItemPicture (RangeID, FromItemKey, ToItemKey, FromCatCode, ToCatCode, PicFile)"
    " VALUES (?1, ?2, ?3, ?4, ?5, ?6) ON CONFLICT (RangeID) DO UPDATE SET"
    " FromItemKey = excluded.FromItemKey, ToItemKey = excluded.ToItemKey,"
    " FromCatCode = excluded.FromCatCode, ToCatCode = excluded.ToCatCode,"
    " PicFile = excluded.PicFile";

// The first bytes of the file, or fewer when it is shorter.
std::string Head(const std::string& fsPath, size_t size) {
    std::ifstream in(fsPath, std::ios::binary);
    std::string head(size, '\0');
    in.read(head.data(), static_cast<std::streamsize>(size));
    head.resize(static_cast<size_t>(in.gcount()));
    return head;
}

// Why a file that SQLite would not open is not a picture database.
std::string ForeignReason(const std::string& head) {
    if (head.empty())
        return "the file is empty";
    if (head.size() >= 19 && (head.compare(4, 15, "Standard Jet DB") == 0 ||
                              head.compare(4, 15, "Standard ACE DB") == 0))
        return "it is an Access (Jet) database, not an SQLite picture database";
    if (head.compare(0, 16, std::string("SQLite format 3\0", 16)) != 0)
        return "it is not an SQLite database";
    return "";
}

void RemoveIfThere(const std::string& fsPath, const std::string& failure) {
    if (unlink(fsPath.c_str()) != 0 && errno != ENOENT)
        throw Error(failure + ": cannot remove " + fsPath + ": " + std::strerror(errno));
}

} // namespace

PictureDb::Inspection PictureDb::inspect() const {
    std::string fsPath = ResolvePath(file_).native();
    struct stat info {};
    if (stat(fsPath.c_str(), &info) != 0) {
        if (errno == ENOENT || errno == ENOTDIR)
            return {FileKind::Missing, ""};
        ThrowSystemError("Cannot look at the picture database", fsPath, errno);
    }
    if (!S_ISREG(info.st_mode))
        return {FileKind::Foreign, "it is not a regular file"};
    if (access(fsPath.c_str(), R_OK) != 0)
        ThrowSystemError("Cannot read the picture database", fsPath, errno);
    if (std::string reason = ForeignReason(Head(fsPath, 100)); !reason.empty())
        return {FileKind::Foreign, reason};
    try {
        Connection db(fsPath, SQLITE_OPEN_READONLY, busyTimeout_,
                      "Cannot read the picture database " + fsPath);
        std::string problem = SchemaProblem(db);
        if (problem.empty())
            problem = Damage(db);
        return {problem.empty() ? FileKind::Pictures : FileKind::Foreign, problem};
    } catch (const Error& e) {
        std::string what = e.what();
        if (what.find("malformed") != std::string::npos ||
            what.find("not a database") != std::string::npos)
            return {FileKind::Foreign, "it is damaged (" + what + ")"};
        throw;
    }
}

namespace {

// Opens an existing picture database; a file of another kind is refused
// before anything is read from or written to its tables.
std::unique_ptr<Connection> OpenPictures(const Path& file, bool write,
                                         std::chrono::milliseconds timeout, const char* doing) {
    std::string fsPath = ResolvePath(file).native();
    std::string failure = std::string(doing) + " " + fsPath;
    struct stat info {};
    if (stat(fsPath.c_str(), &info) != 0)
        ThrowSystemError(doing, fsPath, errno);
    CheckReadSource(Path(fsPath), PictureDb::kMaxFileSize, "the picture database");
    int flags = write ? SQLITE_OPEN_READWRITE : SQLITE_OPEN_READONLY;
    if (std::string reason = ForeignReason(Head(fsPath, 100)); !reason.empty())
        throw Error(failure + ": not a picture database: " + reason);
    auto db = std::make_unique<Connection>(fsPath, flags, timeout, failure);
    if (std::string problem = SchemaProblem(*db); !problem.empty())
        throw Error(failure + ": not a picture database: " + problem);
    return db;
}

} // namespace

std::vector<PictureRange> PictureDb::query(const char* sql) const {
    auto db = OpenPictures(file_, false, busyTimeout_, "Cannot read the picture database");
    Statement rows(*db, sql);
    std::vector<PictureRange> ranges;
    while (rows.step())
        ranges.push_back(RangeAt(rows));
    return ranges;
}

std::vector<PictureRange> PictureDb::rangesById() const {
    return query("SELECT RangeID, FromItemKey, ToItemKey, FromCatCode, ToCatCode, PicFile"
                 " FROM tItemPicture ORDER BY RangeID");
}

std::vector<PictureRange> PictureDb::rangesInLookupOrder() const {
    return query("SELECT RangeID, FromItemKey, ToItemKey, FromCatCode, ToCatCode, PicFile"
                 " FROM tItemPicture ORDER BY FromItemKey COLLATE HEBREW_NOCASE,"
                 " FromCatCode COLLATE HEBREW_NOCASE, RangeID");
}

std::string PictureDb::problemOf(const PictureRange& range) {
    for (const FieldRule& rule : kFieldRules) {
        const std::optional<std::string>& value = range.*rule.field;
        if (value && value->empty())
            return std::string("the ") + rule.meaning + " (" + rule.name + ") is empty";
        if (value && value->size() > rule.size)
            return std::string("the ") + rule.meaning + " (" + rule.name + ") is longer than " +
                   std::to_string(rule.size) + " characters";
    }
    return "";
}

void PictureDb::replaceAll(const std::vector<PictureRange>& ranges) const {
    const char* doing = "Cannot save the picture ranges to";
    for (size_t i = 0; i < ranges.size(); ++i)
        if (std::string problem = problemOf(ranges[i]); !problem.empty())
            throw Error(std::string(doing) + " " + ResolvePath(file_).shown().str() + ": row " +
                        std::to_string(i + 1) + ": " + problem + "; nothing was changed");
    if (ranges.size() > kMaxRanges)
        throw Error(std::string(doing) + " " + ResolvePath(file_).shown().str() + ": " +
                    std::to_string(ranges.size()) + " ranges are more than the " +
                    std::to_string(kMaxRanges) +
                    " the picture settings can list; nothing was changed");
    auto db = OpenPictures(file_, true, busyTimeout_, doing);
    db->begin("BEGIN IMMEDIATE");
    Statement upsert(*db, kUpsert);
    for (size_t i = 0; i < ranges.size(); ++i) {
        int32_t rangeId = static_cast<int32_t>(i + 1);
        BindRange(upsert, rangeId, ranges[i]);
        upsert.step("row " + std::to_string(rangeId) + ": ");
        upsert.reset();
    }
    Statement erase(*db, "DELETE FROM tItemPicture WHERE RangeID > ?1");
    erase.bind(1, static_cast<int64_t>(ranges.size()));
    erase.step();
    db->exec("COMMIT");
}

int32_t PictureDb::add(PictureRange range) const {
    const char* doing = "Cannot add a picture range to";
    if (std::string problem = problemOf(range); !problem.empty())
        throw Error(std::string(doing) + " " + ResolvePath(file_).shown().str() + ": " + problem);
    auto db = OpenPictures(file_, true, busyTimeout_, doing);
    db->begin("BEGIN IMMEDIATE");
    Statement last(*db, "SELECT coalesce(max(RangeID), 0) FROM tItemPicture");
    last.step();
    int64_t highest = last.integer(0);
    last.reset();
    Statement count(*db, "SELECT count(*) FROM tItemPicture");
    count.step();
    if (count.integer(0) >= static_cast<int64_t>(kMaxRanges))
        throw Error(std::string(doing) + " " + ResolvePath(file_).shown().str() + ": it holds " +
                    std::to_string(kMaxRanges) + " ranges, the most the picture settings can list");
    if (highest >= INT32_MAX)
        throw Error(std::string(doing) + " " + ResolvePath(file_).shown().str() +
                    ": no range number is free");
    int32_t rangeId = static_cast<int32_t>(std::max<int64_t>(highest, 0) + 1);
    Statement insert(*db, kUpsert);
    BindRange(insert, rangeId, range);
    insert.step();
    db->exec("COMMIT");
    return rangeId;
}

bool PictureDb::remove(int32_t rangeId) const {
    auto db = OpenPictures(file_, true, busyTimeout_, "Cannot delete a picture range from");
    Statement erase(*db, "DELETE FROM tItemPicture WHERE RangeID = ?1");
    erase.bind(1, rangeId);
    erase.step();
    return sqlite3_changes(db->handle()) > 0;
}

namespace {

// Writes the empty table into a fresh file and makes sure it is on the disk.
void WriteEmptyDatabase(const std::string& fsPath, std::chrono::milliseconds timeout,
                        const std::string& failure) {
    Connection db(fsPath, SQLITE_OPEN_READWRITE, timeout, failure);
    db.exec("PRAGMA journal_mode = DELETE");
    db.begin("BEGIN EXCLUSIVE");
    db.exec(kCreateTable);
    db.exec(kCreateIndex);
    db.exec("COMMIT");
    db.close();
    int fd = open(fsPath.c_str(), O_RDONLY | O_CLOEXEC);
    if (fd < 0 || fsync(fd) != 0) {
        int err = errno;
        if (fd >= 0)
            close(fd);
        throw Error(failure + ": " + std::strerror(err));
    }
    close(fd);
}

// A new file beside the database, named after it; removed again unless kept.
// It gets the permissions of the regular file it replaces, else mode 0600.
class NewFile {
public:
    NewFile(const std::string& fsPath, const std::string& failure) {
        struct stat old {};
        bool hadOld = lstat(fsPath.c_str(), &old) == 0 && S_ISREG(old.st_mode);
        std::random_device random;
        int fd = -1;
        for (int attempt = 0; fd < 0 && attempt < 100; ++attempt) {
            path_ = fsPath + ".new-" + std::to_string(random());
            fd = open(path_.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0600);
            if (fd < 0 && errno != EEXIST)
                break;
        }
        if (fd < 0)
            throw Error(failure + ": cannot create a file beside it: " + std::strerror(errno));
        int err = hadOld && fchmod(fd, old.st_mode & 0777) != 0 ? errno : 0;
        close(fd);
        if (err != 0) {
            unlink(path_.c_str());
            throw Error(failure + ": " + std::strerror(err));
        }
    }
    ~NewFile() {
        if (!kept_)
            unlink(path_.c_str());
    }
    NewFile(const NewFile&) = delete;
    NewFile& operator=(const NewFile&) = delete;

    const std::string& path() const { return path_; }
    void keep() { kept_ = true; }

private:
    std::string path_;
    bool kept_ = false;
};

} // namespace

void PictureDb::create(bool replaceForeign) const {
    std::string fsPath = ResolvePath(file_).native();
    std::string failure = "Cannot create the picture database " + fsPath;
    CheckWriteTarget(Path(fsPath), "the picture database");
    Inspection old = inspect();
    if (old.kind == FileKind::Foreign && !replaceForeign)
        throw Error(failure + ": the file there is not a picture database (" + old.reason +
                    "); it was left as it is");
    NewFile fresh(fsPath, failure);
    WriteEmptyDatabase(fresh.path(), busyTimeout_, failure);
    // Holding the old database's write lock makes sure nobody is halfway
    // through a change of it, so its journal can go with it.
    std::unique_ptr<Connection> lock;
    if (old.kind == FileKind::Pictures) {
        lock = std::make_unique<Connection>(fsPath, SQLITE_OPEN_READWRITE, busyTimeout_, failure);
        lock->begin("BEGIN EXCLUSIVE");
        lock->exec("SELECT count(*) FROM sqlite_master");
    }
    for (const char* suffix : {"-journal", "-wal", "-shm"})
        RemoveIfThere(fsPath + suffix, failure);
    if (rename(fresh.path().c_str(), fsPath.c_str()) != 0)
        throw Error(failure + ": cannot put the new file in place: " + std::strerror(errno));
    fresh.keep();
}

std::string CreatePicDB(const std::string& path, Messages& messages, bool replaceForeign) {
    try {
        PictureDb(path).create(replaceForeign);
        return path;
    } catch (const std::exception& e) {
        ShowFailure(messages, Utf8("תקלה"), e);
        return "";
    }
}

} // namespace dovrel
