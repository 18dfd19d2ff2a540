#include "host/sqlite/index_schema.h"
#include <cstdint>

namespace host {
namespace {

constexpr std::int64_t kApplication = 0x626b6978;
constexpr std::int64_t kVersion = 1;

constexpr const char* kSchema = R"sql(
    BEGIN IMMEDIATE;
    CREATE TABLE meta(key TEXT PRIMARY KEY, value) WITHOUT ROWID;
    CREATE TABLE index_list(attribute TEXT NOT NULL UNIQUE, type INTEGER NOT NULL, created INTEGER NOT NULL);
    CREATE TABLE attribute(id INTEGER PRIMARY KEY, name BLOB NOT NULL, type INTEGER NOT NULL, UNIQUE(name, type));
    CREATE TABLE file(id INTEGER PRIMARY KEY, directory INTEGER NOT NULL, name BLOB NOT NULL,
        inode INTEGER NOT NULL, change_time INTEGER NOT NULL, links INTEGER NOT NULL, settled INTEGER NOT NULL,
        attributes BLOB NOT NULL);
    CREATE UNIQUE INDEX file_place ON file(directory, name);
    CREATE INDEX file_links ON file(inode) WHERE links > 1;
    CREATE TABLE free_id(id INTEGER PRIMARY KEY);
    CREATE TABLE directory(inode INTEGER PRIMARY KEY, parent INTEGER NOT NULL, name BLOB NOT NULL,
        change_time INTEGER NOT NULL);
    CREATE TABLE change_log(sequence INTEGER PRIMARY KEY, files BLOB NOT NULL);
    INSERT INTO meta VALUES('clean', 1), ('complete', 0), ('walked', 0);
    PRAGMA application_id = 0x626b6978;
    PRAGMA user_version = 1;
    COMMIT;
)sql";

} // namespace

DatabaseResult prepare_index_tables(Connection& connection, Connection::Mode mode) {
    DatabaseResult result = connection.execute("PRAGMA journal_mode = WAL; PRAGMA synchronous = NORMAL;"
                                               "PRAGMA cache_size = -16384; PRAGMA wal_autocheckpoint = 4000;"
                                               "PRAGMA mmap_size = 1073741824; PRAGMA temp_store = MEMORY;");
    if (!succeeded(result))
        return result;
    std::int64_t version = connection.query_integer("PRAGMA user_version", -1);
    const std::int64_t tables = connection.query_integer("SELECT count(*) FROM sqlite_master", -1);
    if (version == 0 && tables == 0 && mode == Connection::Mode::create) {
        result = connection.execute(kSchema);
        if (!succeeded(result) && connection.in_transaction())
            connection.execute("ROLLBACK");
        // Another process may have made the tables in the same moment.
        version = connection.query_integer("PRAGMA user_version", -1);
        if (result == DatabaseResult::failed || result == DatabaseResult::busy)
            return result;
    }
    const std::int64_t application = connection.query_integer("PRAGMA application_id", -1);
    if (version == kVersion && application == kApplication)
        return DatabaseResult::done;
    // What could not be read says nothing about the database.
    return version < 0 || application < 0 ? connection.error_result() : DatabaseResult::damaged;
}

} // namespace host
