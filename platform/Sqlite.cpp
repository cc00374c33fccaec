#include "platform/Sqlite.h"

#include "platform/Encoding.h"
#include "platform/Error.h"

#include <sqlite3.h>

#include <cstring>
#include <thread>

namespace dovrel {

SqliteConnection::SqliteConnection(const std::string& fsPath, int flags,
                                   std::chrono::milliseconds busyTimeout, std::string failure)
    : failure_(std::move(failure)), busyTimeout_(busyTimeout) {
    if (sqlite3_open_v2(fsPath.c_str(), &db_, flags, nullptr) != SQLITE_OK) {
        std::string reason = describe();
        sqlite3_close_v2(db_); // a failed open still holds a handle
        throw Error(failure_ + ": " + reason);
    }
    sqlite3_extended_result_codes(db_, 1);
    sqlite3_busy_timeout(db_, static_cast<int>(busyTimeout.count()));
}

SqliteConnection::~SqliteConnection() {
    sqlite3_close_v2(db_);
}

void SqliteConnection::fail(const std::string& where) const {
    throw Error(failure_ + ": " + where + describe());
}

void SqliteConnection::exec(const char* sql) {
    if (sqlite3_exec(db_, sql, nullptr, nullptr, nullptr) != SQLITE_OK)
        fail();
}

void SqliteConnection::begin(const char* sql) {
    auto deadline = std::chrono::steady_clock::now() + busyTimeout_;
    while (sqlite3_exec(db_, sql, nullptr, nullptr, nullptr) != SQLITE_OK) {
        if (code() != SQLITE_BUSY || std::chrono::steady_clock::now() >= deadline)
            fail();
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
}

void SqliteConnection::close() {
    if (sqlite3_close(db_) != SQLITE_OK)
        fail();
    db_ = nullptr;
}

int SqliteConnection::code() const {
    return sqlite3_errcode(db_) & 0xff;
}

std::string SqliteConnection::describe() const {
    if (db_ == nullptr)
        return "out of memory";
    std::string reason = sqlite3_errmsg(db_);
    int err = sqlite3_system_errno(db_);
    int primary = code();
    if (err != 0 &&
        (primary == SQLITE_CANTOPEN || primary == SQLITE_IOERR || primary == SQLITE_FULL))
        reason += std::string(" (") + std::strerror(err) + ")";
    return reason;
}

SqliteStatement::SqliteStatement(SqliteConnection& db, const char* sql) : db_(db) {
    if (sqlite3_prepare_v2(db.handle(), sql, -1, &stmt_, nullptr) != SQLITE_OK)
        db.fail();
}

SqliteStatement::~SqliteStatement() {
    sqlite3_finalize(stmt_);
}

void SqliteStatement::bind(int index, int64_t value) {
    if (sqlite3_bind_int64(stmt_, index, value) != SQLITE_OK)
        db_.fail();
}

void SqliteStatement::bind(int index, const std::optional<std::string>& text) {
    int rc = SQLITE_OK;
    if (!text) {
        rc = sqlite3_bind_null(stmt_, index);
    } else {
        std::string utf8 = ToUtf8(*text).str();
        rc = sqlite3_bind_text(stmt_, index, utf8.data(), static_cast<int>(utf8.size()),
                               SQLITE_TRANSIENT);
    }
    if (rc != SQLITE_OK)
        db_.fail();
}

bool SqliteStatement::step(const std::string& where) {
    int rc = sqlite3_step(stmt_);
    if (rc != SQLITE_ROW && rc != SQLITE_DONE)
        db_.fail(where);
    return rc == SQLITE_ROW;
}

void SqliteStatement::reset() {
    sqlite3_reset(stmt_);
    sqlite3_clear_bindings(stmt_);
}

int64_t SqliteStatement::integer(int column) const {
    return sqlite3_column_int64(stmt_, column);
}

std::optional<std::string> SqliteStatement::text(int column) const {
    if (sqlite3_column_type(stmt_, column) == SQLITE_NULL)
        return std::nullopt;
    const unsigned char* data = sqlite3_column_text(stmt_, column);
    int size = sqlite3_column_bytes(stmt_, column);
    return FromUtf8(
        Utf8(std::string_view(reinterpret_cast<const char*>(data), static_cast<size_t>(size))));
}

} // namespace dovrel
