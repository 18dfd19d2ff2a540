#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>
#include <string>
#include <string_view>

struct sqlite3;
struct sqlite3_stmt;

namespace host {

/// Outcome of a database call, as far as the index tells outcomes apart.
enum class DatabaseResult {
    done,    ///< success, no (further) row
    row,     ///< success, a row can be read
    busy,    ///< another process holds the lock for too long
    damaged, ///< not a database, malformed, or of a form that our statements do not fit
    failed,  ///< disk full, I/O error, out of memory: may succeed later
};

inline bool succeeded(DatabaseResult result) {
    return result == DatabaseResult::done || result == DatabaseResult::row;
}

/// A prepared statement. Parameters and columns count from 0. One thread at a time; must not outlive its
/// connection. Bound bytes are borrowed until the statement is reset.
class Statement {
  public:
    Statement() = default;
    explicit Statement(sqlite3_stmt* statement) : statement_(statement) {}

    bool valid() const { return statement_ != nullptr; }

    Statement& bind(int parameter, std::int64_t value);
    Statement& bind_text(int parameter, std::string_view text);
    Statement& bind_blob(int parameter, std::string_view bytes);
    Statement& bind_blob(int parameter, std::span<const std::byte> bytes);

    /// Resets by itself when it does not answer `row`.
    DatabaseResult step();
    void reset();
    /// One step and a reset.
    DatabaseResult run();

    std::int64_t integer(int column) const;
    /// Valid until the next step or reset.
    std::string_view bytes(int column) const;
    std::span<const std::byte> blob(int column) const;

  private:
    struct Finalize {
        void operator()(sqlite3_stmt* statement) const;
    };
    std::unique_ptr<sqlite3_stmt, Finalize> statement_;
};

/// One connection to a database file. One thread at a time.
class Connection {
  public:
    enum class Mode { create, existing, read_only };

    DatabaseResult open(const std::string& path, Mode mode);
    void close();
    bool is_open() const { return connection_ != nullptr; }

    /// An invalid statement when the text does not fit the schema.
    Statement prepare(const char* sql);
    /// Runs statements without parameters, rows thrown away.
    DatabaseResult execute(const char* sql);
    /// First column of the first row, or `missing`.
    std::int64_t query_integer(const char* sql, std::int64_t missing);
    /// What the last call failed with; `failed` when it did not.
    DatabaseResult error_result() const;
    std::int64_t last_insert_id() const;
    bool in_transaction() const;

  private:
    struct Close {
        void operator()(sqlite3* connection) const;
    };
    std::unique_ptr<sqlite3, Close> connection_;
};

} // namespace host
