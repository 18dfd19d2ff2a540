#pragma once

#include "host/api/entry.h"
#include "host/linux/attribute_list.h"
#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

namespace host {

/// What the index holds of a file's attributes: the names of all and the values of some. True of the file as
/// long as it has this inode and this change time.
struct KnownAttributes {
    bool known = false; ///< else the rest says nothing
    std::uint64_t inode = 0;
    std::int64_t change_time = 0;
    AttributeList list;

    /// The value is `bytes`, and behind them a zero byte where it is `terminated`. Without bytes only the
    /// name is known. Nothing is, when there is no room for the name.
    enum class Ending { plain, terminated };
    void add(std::string_view name);
    void add(std::string_view name, std::uint32_t type, std::span<const std::byte> bytes, Ending ending);
};

/// The plain file that the calling thread was shown last, by a walk or as a query's hit. A program opens what
/// it has just been shown, and need not ask once more what that is. Lasts a twentieth of a second.
///
/// A hint: something else may have taken the file's place since.
void set_seen_file(const EntryRef& ref);
bool was_seen_as_file(const EntryRef& ref);

/// The calling thread's, of the file that was seen last. Not known after set_seen_file(); to be filled in by
/// whoever knows.
KnownAttributes& attributes_of_seen_file();

} // namespace host
