#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string_view>

namespace host {

/// The names of a file's extended attributes and the values of some of them, as they lie on the file, in a
/// fixed room. Not synchronised.
class AttributeList {
  public:
    AttributeList() = default;
    AttributeList(const AttributeList& other) { *this = other; }
    /// Copies what is in use.
    AttributeList& operator=(const AttributeList& other);

    void clear();
    /// Takes a list as flistxattr gives it, written into room(). False, and nothing is known, when it has
    /// more names than can be kept.
    bool take_names(std::size_t size);
    std::span<char> room() { return names_; }
    /// Adds a name that it does not have yet; false when there is no room.
    bool add(std::string_view prefix, std::string_view name);

    bool has(std::string_view extended_name) const { return find(extended_name) != nullptr; }
    /// Nothing where none was kept.
    std::optional<std::span<const std::byte>> value(std::string_view extended_name) const;
    /// Room for a value of the attribute that was added last. Empty when there is none.
    std::span<std::byte> value_of_last(std::size_t size);
    /// Keeps a listed attribute's value, when there is room.
    void keep(std::string_view extended_name, std::span<const std::byte> value);

    /// All names, each with its terminating zero, as flistxattr gives them.
    std::span<const char> names() const { return {names_, names_size_}; }

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
    std::span<std::byte> make_room(Entry& entry, std::size_t size);

    std::size_t names_size_ = 0;
    std::size_t values_size_ = 0;
    std::size_t entry_count_ = 0;
    // Without a value until written: most files are only listed.
    char names_[kNamesRoom];
    std::byte values_[kValuesRoom];
    Entry entries_[kMostEntries];
};

} // namespace host
