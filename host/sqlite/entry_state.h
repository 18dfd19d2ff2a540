#pragma once

#include "host/api/entry.h"
#include "host/linux/attribute_scanner.h"
#include "host/linux/attribute_store.h"
#include "host/linux/descriptor.h"
#include "host/sqlite/attribute_record.h"
#include "host/sqlite/condition.h"
#include "host/sqlite/index_store.h"
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <sys/stat.h>
#include <vector>

namespace host {

using AttributeNames = std::map<std::uint32_t, AttributeNameAndType>;

/// An attribute read from a file, kept.
struct FileAttribute {
    std::string name;
    std::uint32_t type = 0;
    std::string bytes;
    bool complete = true; ///< false: longer than a row takes; `bytes` is then empty
    bool spilled = false; ///< the bytes lie in a blob
};

/// What one file was at one moment: status and attributes belong to the same change time.
struct EntryState {
    struct stat status = {};
    std::vector<FileAttribute> attributes;
    bool settled = false; ///< see IndexRow
    bool whole = true;    ///< no attribute of the file is missing
};

std::int64_t change_time_of(const struct stat& status);

/// The error of a call that says nothing of the entry that it was made for: the medium, the way to it or the
/// process's means have failed. A row that could not be compared for such a reason stays as it is.
bool says_nothing_of_the_entry(int error);

/// The form in which a row keeps this attribute; its number is left to the caller. Borrows from `attribute`.
RecordedAttribute recorded_form(const FileAttribute& attribute);

/// What a row holds of these attributes fits the description of IndexRow::exact.
bool is_recorded_exactly(const EntryState& state);

/// The row is, apart from its place, what would be written for this state.
bool row_agrees(const IndexRow& row, const EntryState& state, const AttributeNames& names);

/// Reads the states of entries. One thread at a time.
class StateReader {
  public:
    StateReader() : scanner_(kLongestRecordedValue + 1) {}

    /// `directory` is open on `device`. ENOENT: there is no such entry. Entries that cannot have attributes,
    /// or whose attributes this user may not read, come back without.
    Status read(int directory, DeviceId device, const char* leaf, EntryState& state);

  private:
    AttributeScanner scanner_;
};

/// Asks a condition of a file by its directory entry; status and attributes are read when they are asked for.
class EntrySubject final : public Subject {
  public:
    EntrySubject(DeviceId device, int directory, std::string_view leaf)
        : device_(device), directory_(directory), leaf_(leaf) {}

    /// What is known already.
    void set_status(const struct stat& status);
    /// A row that is known to be true of the file. Both must outlive this.
    void set_record(const std::vector<std::byte>& record, const AttributeNames& names);
    void set_state(const EntryState& state);

    std::string_view name() override { return leaf_; }
    AttributeValue size() override;
    AttributeValue last_modified() override;
    AttributeValue attribute(const std::string& name) override;

  private:
    bool look();
    bool open();
    AttributeValue from_file(const std::string& name);

    const DeviceId device_;
    const int directory_;
    const std::string_view leaf_;
    struct stat status_ = {};
    enum class Known { no, yes, failed };
    Known status_known_ = Known::no;
    const std::vector<std::byte>* record_ = nullptr;
    const AttributeNames* names_ = nullptr;
    const EntryState* state_ = nullptr;
    Descriptor file_;
    Known file_known_ = Known::no;
    std::vector<std::unique_ptr<std::string>> values_;
};

} // namespace host
