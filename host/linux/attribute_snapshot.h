#pragma once

#include "host/api/result.h"
#include "host/linux/attribute_list.h"
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string_view>

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
    /// Takes what is known from elsewhere, and was found to hold after the moment.
    struct Moment {
        std::uint64_t changes = 0;
        std::int64_t time = 0;
    };
    Moment moment() const;
    void take(const AttributeList& list, const Moment& before);
    /// To be called before the questions below, once each time: false when nothing is known any more.
    bool is_fresh() const;

    bool has(std::string_view extended_name) const { return list_.has(extended_name); }
    /// The value as it was kept; nothing when it was not.
    std::optional<std::span<const std::byte>> value(std::string_view extended_name) const {
        return list_.value(extended_name);
    }
    /// Keeps a value that has just been read, when there is room.
    void keep(std::string_view extended_name, std::span<const std::byte> value) {
        list_.keep(extended_name, value);
    }

    /// Remembers that something was asked for in vain, until the next take().
    void note_miss() { missed_ = true; }
    bool missed_before() const { return missed_; }

    /// All names, each with its terminating zero, as flistxattr gives them.
    std::span<const char> list() const { return list_.names(); }

    /// Ends the snapshots of all files of that volume in this process. Any thread.
    static void volume_changed(std::uint64_t volume);

  private:
    void forget();

    const std::uint64_t volume_;
    std::int64_t taken_at_ = 0; // 0: nothing is known
    bool missed_ = false;
    std::uint64_t changes_ = 0;
    AttributeList list_;
};

} // namespace host
