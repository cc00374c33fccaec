#include "platform/SettingsStore.h"

#include "platform/Encoding.h"
#include "platform/Error.h"

#include <sqlite3.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <filesystem>

#include <fcntl.h>
#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

namespace dovrel {

namespace {

// Names and keys compare without regard to the case of A to Z (NOCASE); the primary key
// makes a second spelling of a key the same row.
const char* const kCreateTable = "CREATE TABLE IF NOT EXISTS settings ("
                                 " app TEXT NOT NULL COLLATE NOCASE,"
                                 " section TEXT NOT NULL COLLATE NOCASE,"
                                 " key TEXT NOT NULL COLLATE NOCASE,"
                                 " value TEXT NOT NULL,"
                                 " PRIMARY KEY (app, section, key)) WITHOUT ROWID";

// One connection for the length of one operation. `failure` starts every error
// description, e.g. 'Cannot save setting "CompPath" to /home/x/.config/dovrel/settings.db'.
class Database {
public:
    Database(const std::string& path, std::chrono::milliseconds timeout, std::string failure)
        : failure_(std::move(failure)) {
        if (sqlite3_open_v2(path.c_str(), &db_, SQLITE_OPEN_READWRITE, nullptr) != SQLITE_OK) {
            std::string reason = describe();
            sqlite3_close_v2(db_); // a failed open still holds a handle
            throw Error(failure_ + ": " + reason);
        }
        sqlite3_extended_result_codes(db_, 1);
        sqlite3_busy_timeout(db_, static_cast<int>(timeout.count()));
    }
    ~Database() { sqlite3_close_v2(db_); } // also rolls back an unfinished transaction
    Database(const Database&) = delete;
    Database& operator=(const Database&) = delete;

    [[noreturn]] void fail() const { throw Error(failure_ + ": " + describe()); }
    void exec(const char* sql) {
        if (sqlite3_exec(db_, sql, nullptr, nullptr, nullptr) != SQLITE_OK)
            fail();
    }
    sqlite3* handle() const { return db_; }
    bool hasTable();

private:
    // SQLite's description of the last failure, with the system's reason when it has one.
    std::string describe() const {
        if (db_ == nullptr)
            return "out of memory";
        std::string reason = sqlite3_errmsg(db_);
        int code = sqlite3_errcode(db_) & 0xff, err = sqlite3_system_errno(db_);
        if (err != 0 && (code == SQLITE_CANTOPEN || code == SQLITE_IOERR))
            reason += std::string(" (") + std::strerror(err) + ")";
        return reason;
    }

    sqlite3* db_ = nullptr;
    std::string failure_;
};

class Statement {
public:
    Statement(Database& db, const char* sql) : db_(db) {
        if (sqlite3_prepare_v2(db.handle(), sql, -1, &stmt_, nullptr) != SQLITE_OK)
            db.fail();
    }
    ~Statement() { sqlite3_finalize(stmt_); }
    Statement(const Statement&) = delete;
    Statement& operator=(const Statement&) = delete;

    // Binds the code page 1255 texts, as UTF-8, to ?1, ?2 ...
    template <typename... Texts> Statement& bind(const Texts&... texts) {
        int index = 0;
        (bindOne(++index, ToUtf8(texts)), ...);
        return *this;
    }
    // True while there is a row to read.
    bool step() {
        int rc = sqlite3_step(stmt_);
        if (rc != SQLITE_ROW && rc != SQLITE_DONE)
            db_.fail();
        return rc == SQLITE_ROW;
    }
    // The text of a column, in code page 1255.
    std::string text(int column) const {
        const unsigned char* data = sqlite3_column_text(stmt_, column);
        int size = sqlite3_column_bytes(stmt_, column);
        return data ? FromUtf8({reinterpret_cast<const char*>(data), static_cast<size_t>(size)})
                    : std::string();
    }

private:
    void bindOne(int index, const std::string& utf8) {
        if (sqlite3_bind_text(stmt_, index, utf8.data(), static_cast<int>(utf8.size()),
                              SQLITE_TRANSIENT) != SQLITE_OK)
            db_.fail();
    }

    Database& db_;
    sqlite3_stmt* stmt_ = nullptr;
};

// Reading sqlite_master also shows a file that is not a database.
bool Database::hasTable() {
    Statement query(*this,
                    "SELECT 1 FROM sqlite_master WHERE type = 'table' AND name = 'settings'");
    return query.step();
}

// Built by appending: g++ 12 at -O3 warns falsely about "..." + std::string.
std::string Quoted(const std::string& cp1255) {
    std::string quoted = "\"";
    quoted += ToUtf8(cp1255);
    quoted += '"';
    return quoted;
}

// Whether there is anything at the path; a missing file (or directory above it) is an
// empty store, any other failure to look is an error.
bool Exists(const std::string& path, const std::string& failure) {
    struct stat info {};
    if (stat(path.c_str(), &info) == 0)
        return true;
    if (errno == ENOENT || errno == ENOTDIR)
        return false;
    throw Error(failure + ": " + std::strerror(errno));
}

std::string HomeDirectory() {
    const char* home = std::getenv("HOME");
    if (home != nullptr && home[0] == '/')
        return home;
    if (const passwd* user = getpwuid(getuid()); user != nullptr && user->pw_dir != nullptr)
        if (user->pw_dir[0] == '/')
            return user->pw_dir;
    throw Error("Cannot find the home directory for the settings file: HOME is not set");
}

} // namespace

std::string SqliteSettingsStore::DefaultPath() {
    const char* config = std::getenv("XDG_CONFIG_HOME");
    std::string base =
        config != nullptr && config[0] == '/' ? std::string(config) : HomeDirectory() + "/.config";
    while (base.size() > 1 && base.back() == '/')
        base.pop_back();
    return base + "/dovrel/settings.db";
}

SqliteSettingsStore::SqliteSettingsStore(std::string path) : path_(std::move(path)) {}

std::string SqliteSettingsStore::GetSetting(const std::string& app, const std::string& section,
                                            const std::string& key,
                                            const std::string& defaultValue) {
    return FindSetting(app, section, key).value_or(defaultValue);
}

std::optional<std::string> SqliteSettingsStore::FindSetting(const std::string& app,
                                                            const std::string& section,
                                                            const std::string& key) {
    CheckNames(app, section, key);
    std::string failure = "Cannot read setting " + Quoted(key) + " from " + path_;
    if (!Exists(path_, failure))
        return std::nullopt;
    Database db(path_, busyTimeout_, failure);
    if (!db.hasTable())
        return std::nullopt;
    Statement query(db, "SELECT value FROM settings WHERE app = ?1 AND section = ?2 AND key = ?3");
    if (!query.bind(app, section, key).step())
        return std::nullopt;
    return query.text(0);
}

void SqliteSettingsStore::SaveSetting(const std::string& app, const std::string& section,
                                      const std::string& key, const std::string& value) {
    CheckNames(app, section, key);
    std::string failure = "Cannot save setting " + Quoted(key) + " to " + path_;
    MakeDirectory(failure);
    MakeFile(failure);
    Database db(path_, busyTimeout_, failure);
    db.exec("BEGIN IMMEDIATE");
    db.exec(kCreateTable);
    Statement upsert(db, "INSERT INTO settings (app, section, key, value) VALUES (?1, ?2, ?3, ?4)"
                         " ON CONFLICT (app, section, key) DO UPDATE SET value = excluded.value");
    upsert.bind(app, section, key, value).step();
    db.exec("COMMIT");
}

bool SqliteSettingsStore::DeleteSetting(const std::string& app, const std::string& section,
                                        const std::string& key) {
    CheckNames(app, section, key);
    std::string failure = "Cannot remove setting " + Quoted(key) + " from " + path_;
    if (!Exists(path_, failure))
        return false;
    Database db(path_, busyTimeout_, failure);
    db.exec("BEGIN IMMEDIATE");
    if (!db.hasTable())
        return false;
    Statement erase(db, "DELETE FROM settings WHERE app = ?1 AND section = ?2 AND key = ?3");
    erase.bind(app, section, key).step();
    bool removed = sqlite3_changes(db.handle()) > 0;
    db.exec("COMMIT");
    return removed;
}

std::vector<SettingsStore::Entry> SqliteSettingsStore::ListSettings(const std::string& app,
                                                                    const std::string& section) {
    std::string failure =
        "Cannot read the settings " + Quoted(app) + " " + Quoted(section) + " from " + path_;
    std::vector<Entry> entries;
    if (!Exists(path_, failure))
        return entries;
    Database db(path_, busyTimeout_, failure);
    if (!db.hasTable())
        return entries;
    Statement query(db, "SELECT key, value FROM settings WHERE app = ?1 AND section = ?2");
    query.bind(app, section);
    while (query.step())
        entries.emplace_back(query.text(0), query.text(1));
    SortByKey(entries);
    return entries;
}

// Creates the missing directories above the file, readable by the user alone.
void SqliteSettingsStore::MakeDirectory(const std::string& failure) const {
    std::filesystem::path dir = std::filesystem::path(path_).parent_path();
    struct stat info {};
    if (dir.empty() || (stat(dir.c_str(), &info) == 0 && S_ISDIR(info.st_mode)))
        return;
    std::filesystem::path partial;
    for (const std::filesystem::path& part : dir) {
        partial /= part;
        if (mkdir(partial.c_str(), 0700) != 0 && errno != EEXIST)
            throw Error(failure + ": cannot create the directory " + partial.string() + ": " +
                        std::strerror(errno));
    }
}

// Creates the file empty (an empty file is an empty database) so that it gets mode 0600.
void SqliteSettingsStore::MakeFile(const std::string& failure) const {
    int fd = open(path_.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0600);
    if (fd >= 0)
        close(fd);
    else if (errno != EEXIST)
        throw Error(failure + ": " + std::strerror(errno));
}

} // namespace dovrel
