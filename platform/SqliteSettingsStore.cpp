#include "platform/SettingsStore.h"

#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/Sqlite.h"

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

// Reading sqlite_master also shows a file that is not a database.
bool HasTable(SqliteConnection& db) {
    SqliteStatement query(db,
                          "SELECT 1 FROM sqlite_master WHERE type = 'table' AND name = 'settings'");
    return query.step();
}

// Binds the texts to ?1, ?2 ... in order.
template <typename... Texts>
SqliteStatement& Bind(SqliteStatement& statement, const Texts&... texts) {
    int index = 0;
    (statement.bind(++index, std::optional<std::string>(texts)), ...);
    return statement;
}

// Built by appending: g++ 12 at -O3 warns falsely about "..." + std::string.
std::string Quoted(const std::string& cp1255) {
    std::string quoted = "\"";
    quoted += ToUtf8(cp1255).str();
    quoted += '"';
    return quoted;
}

// A settings file of this size holds far more than any user saves.
constexpr off_t kMaxStoreSize = 16 * 1024 * 1024;

// Whether the store's file is there; a missing file (or directory above it) is an
// empty store. Anything but a regular file of a sane size is refused: a link
// is not followed, a pipe or a device is not opened.
bool Exists(const std::string& path, const std::string& failure) {
    struct stat info {};
    if (lstat(path.c_str(), &info) != 0) {
        if (errno == ENOENT || errno == ENOTDIR)
            return false;
        throw Error(failure + ": " + std::strerror(errno));
    }
    if (S_ISLNK(info.st_mode))
        throw Error(failure + ": it is a link, which Dovrel does not follow for its settings");
    if (!S_ISREG(info.st_mode))
        throw Error(failure + ": it is not a regular file");
    if (info.st_size > kMaxStoreSize)
        throw Error(failure + ": it is larger than 16 MiB, too large for a settings store");
    return true;
}

constexpr int kRead = SQLITE_OPEN_READWRITE | SQLITE_OPEN_NOFOLLOW;

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
    SqliteConnection db(path_, kRead, busyTimeout_, failure);
    if (!HasTable(db))
        return std::nullopt;
    SqliteStatement query(
        db, "SELECT value FROM settings WHERE app = ?1 AND section = ?2 AND key = ?3");
    if (!Bind(query, app, section, key).step())
        return std::nullopt;
    return query.text(0).value_or("");
}

void SqliteSettingsStore::SaveSetting(const std::string& app, const std::string& section,
                                      const std::string& key, const std::string& value) {
    CheckNames(app, section, key);
    std::string failure = "Cannot save setting " + Quoted(key) + " to " + path_;
    MakeDirectory(failure);
    MakeFile(failure);
    Exists(path_, failure);
    SqliteConnection db(path_, kRead, busyTimeout_, failure);
    db.begin("BEGIN EXCLUSIVE");
    db.exec(kCreateTable);
    SqliteStatement upsert(db,
                           "INSERT INTO settings (app, section, key, value) VALUES (?1, ?2, ?3, ?4)"
                           " ON CONFLICT (app, section, key) DO UPDATE SET value = excluded.value");
    Bind(upsert, app, section, key, value).step();
    db.exec("COMMIT");
}

bool SqliteSettingsStore::DeleteSetting(const std::string& app, const std::string& section,
                                        const std::string& key) {
    CheckNames(app, section, key);
    std::string failure = "Cannot remove setting " + Quoted(key) + " from " + path_;
    if (!Exists(path_, failure))
        return false;
    SqliteConnection db(path_, kRead, busyTimeout_, failure);
    db.begin("BEGIN EXCLUSIVE");
    if (!HasTable(db))
        return false;
    SqliteStatement erase(db, "DELETE FROM settings WHERE app = ?1 AND section = ?2 AND key = ?3");
    Bind(erase, app, section, key).step();
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
    SqliteConnection db(path_, kRead, busyTimeout_, failure);
    if (!HasTable(db))
        return entries;
    SqliteStatement query(db, "SELECT key, value FROM settings WHERE app = ?1 AND section = ?2");
    Bind(query, app, section);
    while (query.step())
        entries.emplace_back(query.text(0).value_or(""), query.text(1).value_or(""));
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
