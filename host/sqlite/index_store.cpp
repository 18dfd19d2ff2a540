#include "host/sqlite/index_store.h"
#include "host/sqlite/index_schema.h"
#include <algorithm>
#include <cstring>

namespace host {
namespace {

constexpr std::int64_t kKeptTransactions = 4096;

std::int64_t as_signed(std::uint64_t number) {
    return static_cast<std::int64_t>(number);
}
std::uint64_t as_unsigned(std::int64_t number) {
    return static_cast<std::uint64_t>(number);
}

// The column tells both.
std::int64_t settled_column(const IndexRow& row) {
    return row.settled ? row.exact ? 2 : 1 : 0;
}

} // namespace

DatabaseResult IndexStore::open(const std::string& path, Connection::Mode mode) {
    DatabaseResult result = connection_.open(path, mode);
    if (succeeded(result))
        result = prepare_index_tables(connection_, mode);
    if (!succeeded(result))
        close();
    return result;
}

void IndexStore::close() {
    statements_.clear();
    connection_.close();
}

Statement& IndexStore::statement(const char* sql) {
    const auto found = statements_.find(sql);
    if (found != statements_.end() && found->second.valid())
        return found->second;
    return statements_[sql] = connection_.prepare(sql);
}

DatabaseResult IndexStore::begin() {
    no_free_ids_ = false;
    next_id_ = 0;
    return connection_.execute("BEGIN IMMEDIATE");
}

DatabaseResult IndexStore::begin_reading() {
    return statement("BEGIN").run();
}

DatabaseResult IndexStore::commit() {
    return statement("COMMIT").run();
}

void IndexStore::roll_back() {
    for (auto& [sql, prepared] : statements_)
        prepared.reset();
    if (connection_.in_transaction())
        connection_.execute("ROLLBACK");
}

std::int64_t IndexStore::meta(const char* key, std::int64_t missing) {
    Statement& select = statement("SELECT value FROM meta WHERE key = ?");
    if (!select.valid())
        return missing;
    const std::int64_t value =
        select.bind_text(0, key).step() == DatabaseResult::row ? select.integer(0) : missing;
    select.reset();
    return value;
}

DatabaseResult IndexStore::set_meta(const char* key, std::int64_t value) {
    return statement("INSERT INTO meta VALUES(?, ?) ON CONFLICT(key) DO UPDATE SET value = excluded.value")
        .bind_text(0, key)
        .bind(1, value)
        .run();
}

DatabaseResult IndexStore::set_meta_durably(const char* key, std::int64_t value) {
    DatabaseResult result = connection_.execute("PRAGMA synchronous = FULL");
    if (succeeded(result))
        result = set_meta(key, value);
    const DatabaseResult restored = connection_.execute("PRAGMA synchronous = NORMAL");
    return succeeded(result) ? restored : result;
}

DatabaseResult IndexStore::indices(std::vector<ListedIndex>& list) {
    list.clear();
    Statement& select = statement("SELECT attribute, type, created FROM index_list ORDER BY rowid");
    DatabaseResult result = DatabaseResult::done;
    while ((result = select.step()) == DatabaseResult::row)
        list.push_back(
            {std::string(select.bytes(0)), static_cast<std::uint32_t>(select.integer(1)), select.integer(2)});
    return result;
}

DatabaseResult IndexStore::add_index(const ListedIndex& index) {
    return statement("INSERT OR IGNORE INTO index_list VALUES(?, ?, ?)")
        .bind_text(0, index.attribute)
        .bind(1, index.type)
        .bind(2, index.created)
        .run();
}

DatabaseResult IndexStore::remove_index(const std::string& attribute) {
    return statement("DELETE FROM index_list WHERE attribute = ?").bind_text(0, attribute).run();
}

DatabaseResult IndexStore::attributes(std::map<std::uint32_t, AttributeNameAndType>& names) {
    Statement& select = statement("SELECT id, name, type FROM attribute");
    DatabaseResult result = DatabaseResult::done;
    names.clear();
    while ((result = select.step()) == DatabaseResult::row)
        names[static_cast<std::uint32_t>(select.integer(0))] = {
            std::string(select.bytes(1)), static_cast<std::uint32_t>(select.integer(2))};
    return result;
}

DatabaseResult IndexStore::attribute_id(std::string_view name, std::uint32_t type, std::uint32_t& id) {
    Statement& select = statement("SELECT id FROM attribute WHERE name = ? AND type = ?");
    DatabaseResult result = select.bind_blob(0, name).bind(1, type).step();
    if (result == DatabaseResult::row) {
        id = static_cast<std::uint32_t>(select.integer(0));
        select.reset();
        return result;
    }
    if (result != DatabaseResult::done)
        return result;
    result =
        statement("INSERT INTO attribute(name, type) VALUES(?, ?)").bind_blob(0, name).bind(1, type).run();
    id = static_cast<std::uint32_t>(connection_.last_insert_id());
    return result;
}

void IndexStore::read_row(const Statement& select, IndexRow& row) {
    row.id = static_cast<RowNumber>(select.integer(0));
    row.directory = as_unsigned(select.integer(1));
    row.name.assign(select.bytes(2));
    row.inode = as_unsigned(select.integer(3));
    row.change_time = select.integer(4);
    row.links = static_cast<std::uint32_t>(select.integer(5));
    const std::int64_t settled = select.integer(6);
    row.settled = settled != 0;
    row.exact = settled == 2;
}

DatabaseResult IndexStore::find(std::uint64_t directory, std::string_view name, IndexRow& row) {
    Statement& select =
        statement("SELECT id, directory, name, inode, change_time, links, settled, attributes "
                  "FROM file WHERE directory = ? AND name = ?");
    const DatabaseResult result = select.bind(0, as_signed(directory)).bind_blob(1, name).step();
    if (result == DatabaseResult::row) {
        read_row(select, row);
        const auto record = select.blob(7);
        row.attributes.assign(record.begin(), record.end());
        select.reset();
    }
    return result;
}

DatabaseResult IndexStore::find_place(std::uint64_t directory, std::string_view name, IndexRow& row) {
    Statement& select = statement("SELECT id, directory, name, inode, change_time, links, settled FROM file "
                                  "WHERE directory = ? AND name = ?");
    const DatabaseResult result = select.bind(0, as_signed(directory)).bind_blob(1, name).step();
    if (result == DatabaseResult::row) {
        read_row(select, row);
        select.reset();
    }
    return result;
}

DatabaseResult IndexStore::read(RowNumber id, IndexRow& row) {
    Statement& select =
        statement("SELECT id, directory, name, inode, change_time, links, settled, attributes "
                  "FROM file WHERE id = ?");
    const DatabaseResult result = select.bind(0, id).step();
    if (result == DatabaseResult::row) {
        read_row(select, row);
        const auto record = select.blob(7);
        row.attributes.assign(record.begin(), record.end());
        select.reset();
    }
    return result;
}

DatabaseResult IndexStore::rows_of_inode(std::uint64_t inode, std::vector<RowNumber>& ids) {
    Statement& select = statement("SELECT id FROM file WHERE inode = ? AND links > 1");
    select.bind(0, as_signed(inode));
    DatabaseResult result = DatabaseResult::done;
    while ((result = select.step()) == DatabaseResult::row)
        ids.push_back(static_cast<RowNumber>(select.integer(0)));
    return result;
}

DatabaseResult IndexStore::rows_in(std::uint64_t directory, std::vector<IndexRow>& rows) {
    Statement& select = statement("SELECT id, directory, name, inode, change_time, links, settled FROM file "
                                  "WHERE directory = ? ORDER BY name");
    select.bind(0, as_signed(directory));
    rows.clear();
    DatabaseResult result = DatabaseResult::done;
    while ((result = select.step()) == DatabaseResult::row)
        read_row(select, rows.emplace_back());
    return result;
}

DatabaseResult IndexStore::directories_of_rows(std::vector<std::uint64_t>& directories) {
    Statement& select = statement("SELECT DISTINCT directory FROM file ORDER BY directory");
    DatabaseResult result = DatabaseResult::done;
    while ((result = select.step()) == DatabaseResult::row)
        directories.push_back(as_unsigned(select.integer(0)));
    return result;
}

DatabaseResult IndexStore::take_id(std::int64_t& id) {
    if (!no_free_ids_) {
        Statement& free =
            statement("DELETE FROM free_id WHERE id = (SELECT min(id) FROM free_id) RETURNING id");
        const DatabaseResult result = free.step();
        if (result == DatabaseResult::row) {
            id = free.integer(0);
            free.reset();
        }
        if (result != DatabaseResult::done)
            return result;
        no_free_ids_ = true;
    }
    if (next_id_ == 0) {
        Statement& largest = statement("SELECT max(id) FROM file");
        const DatabaseResult result = largest.step();
        if (result != DatabaseResult::row)
            return result;
        next_id_ = largest.integer(0) + 1;
        largest.reset();
    }
    id = next_id_++;
    return DatabaseResult::done;
}

DatabaseResult IndexStore::insert(IndexRow& row) {
    std::int64_t id = 0;
    const DatabaseResult taken = take_id(id);
    if (!succeeded(taken))
        return taken;
    if (id > kLargestRow)
        return DatabaseResult::damaged;
    row.id = static_cast<RowNumber>(id);
    return statement("INSERT INTO file VALUES(?, ?, ?, ?, ?, ?, ?, ?)")
        .bind(0, id)
        .bind(1, as_signed(row.directory))
        .bind_blob(2, row.name)
        .bind(3, as_signed(row.inode))
        .bind(4, row.change_time)
        .bind(5, row.links)
        .bind(6, settled_column(row))
        .bind_blob(7, row.attributes)
        .run();
}

DatabaseResult IndexStore::update(const IndexRow& row) {
    return statement("UPDATE file SET inode = ?, change_time = ?, links = ?, settled = ?, attributes = ? "
                     "WHERE id = ?")
        .bind(0, as_signed(row.inode))
        .bind(1, row.change_time)
        .bind(2, row.links)
        .bind(3, settled_column(row))
        .bind_blob(4, row.attributes)
        .bind(5, row.id)
        .run();
}

DatabaseResult IndexStore::erase(RowNumber id) {
    no_free_ids_ = false;
    const DatabaseResult result = statement("DELETE FROM file WHERE id = ?").bind(0, id).run();
    if (!succeeded(result))
        return result;
    return statement("INSERT OR IGNORE INTO free_id VALUES(?)").bind(0, id).run();
}

DatabaseResult IndexStore::largest_row(RowNumber& largest) {
    const std::int64_t found = connection_.query_integer("SELECT max(id) FROM file", -1);
    if (found < 0)
        return connection_.error_result();
    largest = static_cast<RowNumber>(found);
    return DatabaseResult::done;
}

DatabaseResult IndexStore::scan(RowNumber first, RowNumber last,
                                const std::function<void(RowNumber, std::span<const std::byte>)>& visit) {
    Statement& select = statement("SELECT id, attributes FROM file WHERE id BETWEEN ? AND ?");
    select.bind(0, first).bind(1, last);
    DatabaseResult result = DatabaseResult::done;
    while ((result = select.step()) == DatabaseResult::row)
        visit(static_cast<RowNumber>(select.integer(0)), select.blob(1));
    return result;
}

DatabaseResult IndexStore::directory(std::uint64_t inode, KnownDirectory& known) {
    Statement& select = statement("SELECT inode, parent, name, change_time FROM directory WHERE inode = ?");
    const DatabaseResult result = select.bind(0, as_signed(inode)).step();
    if (result == DatabaseResult::row) {
        known = {as_unsigned(select.integer(0)), as_unsigned(select.integer(1)), std::string(select.bytes(2)),
                 select.integer(3)};
        select.reset();
    }
    return result;
}

DatabaseResult IndexStore::all_directories(std::vector<KnownDirectory>& list) {
    Statement& select = statement("SELECT inode, parent, name, change_time FROM directory");
    DatabaseResult result = DatabaseResult::done;
    while ((result = select.step()) == DatabaseResult::row)
        list.push_back({as_unsigned(select.integer(0)), as_unsigned(select.integer(1)),
                        std::string(select.bytes(2)), select.integer(3)});
    return result;
}

DatabaseResult IndexStore::put_directory(const KnownDirectory& known) {
    return statement("INSERT OR REPLACE INTO directory VALUES(?, ?, ?, ?)")
        .bind(0, as_signed(known.inode))
        .bind(1, as_signed(known.parent))
        .bind_blob(2, known.name)
        .bind(3, known.change_time)
        .run();
}

DatabaseResult IndexStore::erase_directory(std::uint64_t inode) {
    return statement("DELETE FROM directory WHERE inode = ?").bind(0, as_signed(inode)).run();
}

DatabaseResult IndexStore::log_changes(const std::vector<RowNumber>& rows, std::int64_t& sequence) {
    const std::span<const std::byte> bytes = std::as_bytes(std::span(rows));
    const DatabaseResult result =
        statement("INSERT INTO change_log(files) VALUES(?)").bind_blob(0, bytes).run();
    sequence = connection_.last_insert_id();
    if (!succeeded(result))
        return result;
    return statement("DELETE FROM change_log WHERE sequence <= ?")
        .bind(0, sequence - kKeptTransactions)
        .run();
}

DatabaseResult IndexStore::last_sequence(std::int64_t& last) {
    last = connection_.query_integer("SELECT max(sequence) FROM change_log", -1);
    return last < 0 ? connection_.error_result() : DatabaseResult::done;
}

DatabaseResult IndexStore::changes_since(std::int64_t seen, std::vector<RowNumber>& rows, bool& whole,
                                         std::int64_t& last) {
    Statement& select =
        statement("SELECT sequence, files FROM change_log WHERE sequence > ? ORDER BY sequence");
    select.bind(0, seen);
    DatabaseResult result = DatabaseResult::done;
    whole = true;
    last = seen;
    while ((result = select.step()) == DatabaseResult::row) {
        if (select.integer(0) != last + 1)
            whole = false;
        last = select.integer(0);
        const std::string_view files = select.bytes(1);
        const std::size_t count = files.size() / sizeof(RowNumber);
        const std::size_t old = rows.size();
        rows.resize(old + count);
        if (count > 0)
            std::memcpy(rows.data() + old, files.data(), count * sizeof(RowNumber));
    }
    std::sort(rows.begin(), rows.end());
    rows.erase(std::unique(rows.begin(), rows.end()), rows.end());
    return result;
}

std::int64_t IndexStore::data_version() {
    return connection_.query_integer("PRAGMA data_version", 0);
}

} // namespace host
