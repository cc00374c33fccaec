#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>

struct sqlite3;
struct sqlite3_stmt;

namespace dovrel {

// One SQLite connection for the length of one operation; closing it rolls
// back whatever was not committed. Every failure is an Error that starts
// with `failure` (what was being done, and to which file) and ends with
// SQLite's reason, and the system's where it has one.
class SqliteConnection {
public:
    // fsPath is the file system's (UTF-8) name; flags are sqlite3_open_v2's.
    SqliteConnection(const std::string& fsPath, int flags, std::chrono::milliseconds busyTimeout,
                     std::string failure);
    ~SqliteConnection();
    SqliteConnection(const SqliteConnection&) = delete;
    SqliteConnection& operator=(const SqliteConnection&) = delete;

    [[noreturn]] void fail(const std::string& where = {}) const;
    void exec(const char* sql);
    // BEGIN IMMEDIATE or BEGIN EXCLUSIVE, tried again while another process
    // holds the file, until the busy timeout has passed: SQLite's own waiting
    // gives up at once in some races (two processes making the same new file).
    void begin(const char* sql);
    // Closes now, so that a failure to finish writing is reported.
    void close();
    // The primary result code of the last call.
    int code() const;
    sqlite3* handle() const { return db_; }
    const std::string& failure() const { return failure_; }

private:
    std::string describe() const;

    sqlite3* db_ = nullptr;
    std::string failure_;
    std::chrono::milliseconds busyTimeout_;
};

// A prepared statement. Texts cross as code page 1255 here and UTF-8 in the
// file; a missing text is Null.
class SqliteStatement {
public:
    SqliteStatement(SqliteConnection& db, const char* sql);
    ~SqliteStatement();
    SqliteStatement(const SqliteStatement&) = delete;
    SqliteStatement& operator=(const SqliteStatement&) = delete;

    void bind(int index, int64_t value);
    void bind(int index, const std::optional<std::string>& text);
    // True while there is a row to read; `where` goes before the reason.
    bool step(const std::string& where = {});
    void reset();
    int64_t integer(int column) const;
    std::optional<std::string> text(int column) const;

private:
    SqliteConnection& db_;
    sqlite3_stmt* stmt_ = nullptr;
};

} // namespace dovrel
