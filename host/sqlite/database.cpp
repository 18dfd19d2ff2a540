#include "host/sqlite/database.h"
#include <sqlite3.h>

namespace host {
namespace {

DatabaseResult result_of(int code) {
    switch (code & 0xff) {
    case SQLITE_OK:
    case SQLITE_DONE:
        return DatabaseResult::done;
    case SQLITE_ROW:
        return DatabaseResult::row;
    case SQLITE_BUSY:
    case SQLITE_LOCKED:
        return DatabaseResult::busy;
    case SQLITE_CORRUPT:
    case SQLITE_NOTADB:
    case SQLITE_ERROR:
    case SQLITE_SCHEMA:
    case SQLITE_MISMATCH:
    case SQLITE_CONSTRAINT:
    case SQLITE_TOOBIG:
        return DatabaseResult::damaged;
    default:
        return DatabaseResult::failed;
    }
}

constexpr int kBusyMilliseconds = 10000;

} // namespace

void Statement::Finalize::operator()(sqlite3_stmt* statement) const {
    sqlite3_finalize(statement);
}

Statement& Statement::bind(int parameter, std::int64_t value) {
    sqlite3_bind_int64(statement_.get(), parameter + 1, value);
    return *this;
}

Statement& Statement::bind_text(int parameter, std::string_view text) {
    sqlite3_bind_text64(statement_.get(), parameter + 1, text.data(), text.size(), SQLITE_STATIC,
                        SQLITE_UTF8);
    return *this;
}

Statement& Statement::bind_blob(int parameter, std::string_view bytes) {
    // A null pointer would bind NULL, which equals nothing.
    sqlite3_bind_blob64(statement_.get(), parameter + 1, bytes.empty() ? "" : bytes.data(), bytes.size(),
                        SQLITE_STATIC);
    return *this;
}

Statement& Statement::bind_blob(int parameter, std::span<const std::byte> bytes) {
    return bind_blob(parameter, {reinterpret_cast<const char*>(bytes.data()), bytes.size()});
}

DatabaseResult Statement::step() {
    if (!valid())
        return DatabaseResult::damaged;
    const DatabaseResult result = result_of(sqlite3_step(statement_.get()));
    if (result != DatabaseResult::row)
        sqlite3_reset(statement_.get());
    return result;
}

void Statement::reset() {
    sqlite3_reset(statement_.get());
}

DatabaseResult Statement::run() {
    const DatabaseResult result = step();
    reset();
    return result;
}

std::int64_t Statement::integer(int column) const {
    return sqlite3_column_int64(statement_.get(), column);
}

std::string_view Statement::bytes(int column) const {
    const void* data = sqlite3_column_blob(statement_.get(), column);
    const int size = sqlite3_column_bytes(statement_.get(), column);
    return data == nullptr ? std::string_view()
                           : std::string_view(static_cast<const char*>(data), static_cast<std::size_t>(size));
}

std::span<const std::byte> Statement::blob(int column) const {
    const std::string_view view = bytes(column);
    return {reinterpret_cast<const std::byte*>(view.data()), view.size()};
}

void Connection::Close::operator()(sqlite3* connection) const {
    sqlite3_close_v2(connection);
}

DatabaseResult Connection::open(const std::string& path, Mode mode) {
    int flags = SQLITE_OPEN_NOMUTEX | SQLITE_OPEN_PRIVATECACHE;
    flags |= mode == Mode::read_only ? SQLITE_OPEN_READONLY : SQLITE_OPEN_READWRITE;
    if (mode == Mode::create)
        flags |= SQLITE_OPEN_CREATE;
    sqlite3* opened = nullptr;
    const int code = sqlite3_open_v2(path.c_str(), &opened, flags, nullptr);
    connection_.reset(opened);
    if (code != SQLITE_OK) {
        connection_.reset();
        return result_of(code);
    }
    sqlite3_busy_timeout(opened, kBusyMilliseconds);
    return DatabaseResult::done;
}

void Connection::close() {
    connection_.reset();
}

Statement Connection::prepare(const char* sql) {
    sqlite3_stmt* statement = nullptr;
    if (connection_)
        sqlite3_prepare_v3(connection_.get(), sql, -1, SQLITE_PREPARE_PERSISTENT, &statement, nullptr);
    return Statement(statement);
}

DatabaseResult Connection::execute(const char* sql) {
    if (!connection_)
        return DatabaseResult::failed;
    return result_of(sqlite3_exec(connection_.get(), sql, nullptr, nullptr, nullptr));
}

std::int64_t Connection::query_integer(const char* sql, std::int64_t missing) {
    Statement statement = prepare(sql);
    if (!statement.valid() || statement.step() != DatabaseResult::row)
        return missing;
    return statement.integer(0);
}

DatabaseResult Connection::error_result() const {
    const DatabaseResult result =
        connection_ ? result_of(sqlite3_errcode(connection_.get())) : DatabaseResult::failed;
    return succeeded(result) ? DatabaseResult::failed : result;
}

std::int64_t Connection::last_insert_id() const {
    return sqlite3_last_insert_rowid(connection_.get());
}

bool Connection::in_transaction() const {
    return connection_ && sqlite3_get_autocommit(connection_.get()) == 0;
}

} // namespace host
