#pragma once

#include "host/api/result.h"
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string_view>
#include <vector>

namespace host {

/// What has just been read of one open file's attributes, so that a program that lists them, looks at each
/// and then reads them asks the system once. It lasts kLifetime from its listing, and ends at once when any
/// attribute of the file's volume is changed through this process. So a change by this process is always
/// seen, a change by another program at most kLifetime late.
///
/// Names and values are those of extended attributes, as they lie on the file. One thread at a time.
class AttributeSnapshot {
  public:
    static constexpr std::int64_t kLifetime = 100'000; // nanoseconds

    /// `volume` picks the count of changes that ends the snapshot.
    explicit AttributeSnapshot(std::uint64_t volume) : volume_(volume) {}

    /// Lists the file's attributes anew and forgets all values. An error of flistxattr; lists too long to be
    /// kept answer ERANGE. Nothing is known then.
    Status take(int descriptor);
    /// To be called before the questions below, once each time: false when nothing is known any more.
    bool is_fresh() const;

    bool has(std::string_view extended_name) const { return find(extended_name) != nullptr; }
    /// The value as it was kept; nothing when it was not.
    std::optional<std::span<const std::byte>> value(std::string_view extended_name) const;
    /// Keeps a value that has just been read, when there is room.
    void keep(std::string_view extended_name, std::span<const std::byte> value);

    /// Remembers that something was asked for in vain, until the next take().
    void note_miss() { missed_ = true; }
    bool missed_before() const { return missed_; }

    /// All names, each with its terminating zero, as flistxattr gives them.
    std::span<const char> list() const { return {names_, names_size_}; }

    /// Ends the snapshots of all files of that volume in this process. Any thread.
    static void volume_changed(std::uint64_t volume);

  private:
    struct Entry {
        std::uint16_t name;      // where it begins in names_
        std::uint16_t name_size; // without its terminator
        std::uint16_t value;     // where it begins in values_
        std::uint16_t value_size;
        bool has_value;
    };
    static constexpr std::size_t kNamesRoom = 1024;
    static constexpr std::size_t kValuesRoom = 1536;
    static constexpr std::size_t kMostEntries = 32;

    const Entry* find(std::string_view extended_name) const;
    void forget();

    const std::uint64_t volume_;
    std::int64_t taken_at_ = 0; // 0: nothing is known
    bool missed_ = false;
    std::uint64_t changes_ = 0;
    std::size_t names_size_ = 0;
    std::size_t values_size_ = 0;
    std::size_t entry_count_ = 0;
    // Without a value until written: most files are only listed.
    char names_[kNamesRoom];
    std::byte values_[kValuesRoom];
    Entry entries_[kMostEntries];
};

} // namespace host
