// The typed, ordered, multi-valued fields of a message. Internal to the kits.
#pragma once

#include <SupportDefs.h>

#include <span>
#include <string>
#include <string_view>
#include <vector>

// Longest name of a field in bytes; the most bytes that a field, or a flattened message, may take.
inline constexpr size_t kMaxFieldNameLength = 255;
inline constexpr size_t kMaxMessageSize = INT32_MAX;

// One name with its items, at least one. Items lie end to end in `bytes`; those of varying size begin at
// multiples of eight, so that any of them may be read in place.
class MessageField {
  public:
    MessageField(std::string_view fieldName, type_code fieldType, bool isFixedSize)
        : name(fieldName), type(fieldType), fixedSize(isFixedSize) {}

    uint32 CountItems() const;
    std::span<const char> ItemAt(uint32 index) const;
    // B_BAD_VALUE for no bytes, or another size in a field of fixed size; B_NO_MEMORY past kMaxMessageSize.
    status_t AddItem(std::span<const char> item);
    status_t ReplaceItem(uint32 index, std::span<const char> item);
    void RemoveItem(uint32 index);
    void Reserve(uint32 items, size_t itemBytes);
    // Bytes of all items, without the gaps between them.
    uint64 ItemBytes() const;
    // All items of a field of fixed size.
    std::span<const char> FixedItems() const { return mBytes; }
    void SetFixedItems(std::span<const char> items, uint32 itemSize);

    std::string name;
    type_code type;
    bool fixedSize;

  private:
    struct Place {
        uint32 offset;
        uint32 size;
    };
    void Rebuild(uint32 changedIndex, std::span<const char> item);

    uint32 mItemSize = 0;
    std::vector<char> mBytes;
    // Varying size only.
    std::vector<Place> mPlaces;
};

// Not synchronised. Pointers to fields and items hold until the next change.
class MessageFields {
  public:
    const MessageField* Find(std::string_view name) const;
    MessageField* Find(std::string_view name);
    // B_BAD_VALUE for a name that is too long, B_BAD_TYPE when the field exists with another type.
    status_t Add(std::string_view name, type_code type, bool fixedSize, std::span<const char> item,
                 uint32 expectedItems);
    void Remove(const MessageField* field);
    void Append(MessageField&& field) { mFields.push_back(std::move(field)); }
    void Clear() { mFields.clear(); }

    const std::vector<MessageField>& All() const { return mFields; }

  private:
    std::vector<MessageField> mFields;
};
