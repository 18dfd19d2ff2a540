#include "MessageCodec.h"

#include <TypeConstants.h>

#include <algorithm>
#include <bit>
#include <cstring>
#include <utility>

// Items go into the form as they lie in memory.
static_assert(std::endian::native == std::endian::little, "the form of messages is little-endian");

namespace {

constexpr unsigned char kMagic[4] = {'B', 'K', 'M', 1};
constexpr size_t kFieldHeaderSize = 16;
constexpr uint16 kFixedSizeFlag = 1;

template <typename Number>
Number ReadNumber(const char* bytes) {
    Number number;
    std::memcpy(&number, bytes, sizeof(number));
    return number;
}

template <typename Number>
char* WriteNumber(char* bytes, Number number) {
    std::memcpy(bytes, &number, sizeof(number));
    return bytes + sizeof(number);
}

char* WriteBytes(char* target, std::span<const char> bytes) {
    if (!bytes.empty())
        std::memcpy(target, bytes.data(), bytes.size());
    return target + bytes.size();
}

uint64 ItemBlockSize(const MessageField& field) {
    return field.ItemBytes() + (field.fixedSize ? 0 : uint64{field.CountItems()} * sizeof(uint32));
}

// A field whose borders have been checked; its parts point into the form.
struct FieldView {
    type_code type = 0;
    bool fixedSize = false;
    uint32 count = 0;
    std::string_view name;
    std::span<const char> items;
};

// Takes the first field off `rest`. False when it does not fit or breaks a rule of its own.
bool TakeField(std::span<const char>& rest, FieldView& view) {
    if (rest.size() < kFieldHeaderSize)
        return false;
    view.type = ReadNumber<uint32>(rest.data());
    const uint16 flags = ReadNumber<uint16>(rest.data() + 4);
    const size_t nameLength = ReadNumber<uint16>(rest.data() + 6);
    view.count = ReadNumber<uint32>(rest.data() + 8);
    const size_t itemsSize = ReadNumber<uint32>(rest.data() + 12);
    if ((flags & ~kFixedSizeFlag) != 0 || nameLength > kMaxFieldNameLength || view.count == 0)
        return false;
    view.fixedSize = (flags & kFixedSizeFlag) != 0;
    rest = rest.subspan(kFieldHeaderSize);
    if (rest.size() < nameLength || rest.size() - nameLength < itemsSize)
        return false;
    view.name = {rest.data(), nameLength};
    view.items = rest.subspan(nameLength, itemsSize);
    rest = rest.subspan(nameLength + itemsSize);
    if (view.name.find('\0') != std::string_view::npos)
        return false;
    if (view.fixedSize)
        return itemsSize >= view.count && itemsSize % view.count == 0;
    return itemsSize / (sizeof(uint32) + 1) >= view.count;
}

// Takes the first item of varying size off `rest`.
bool TakeItem(std::span<const char>& rest, std::span<const char>& item) {
    if (rest.size() < sizeof(uint32))
        return false;
    const size_t size = ReadNumber<uint32>(rest.data());
    rest = rest.subspan(sizeof(uint32));
    if (size == 0 || size > rest.size())
        return false;
    item = rest.first(size);
    rest = rest.subspan(size);
    return true;
}

// Calls `visit(item)` for each item until it answers false; false when it did or the items do not fill the
// block exactly.
template <typename Visitor>
bool ForEachItem(const FieldView& view, Visitor visit) {
    if (view.fixedSize) {
        const size_t itemSize = view.items.size() / view.count;
        for (uint32 index = 0; index < view.count; index++) {
            if (!visit(view.items.subspan(index * itemSize, itemSize)))
                return false;
        }
        return true;
    }
    std::span<const char> rest = view.items;
    for (uint32 index = 0; index < view.count; index++) {
        std::span<const char> item;
        if (!TakeItem(rest, item) || !visit(item))
            return false;
    }
    return rest.empty();
}

bool NamesAreUnique(std::vector<std::string_view>& names) {
    std::sort(names.begin(), names.end());
    return std::adjacent_find(names.begin(), names.end()) == names.end();
}

// Checks the whole form and everything nested in it. The recursion ends at `levelsLeft`, so a hostile form
// cannot exhaust the stack. `depth` receives the number of levels found.
bool IsWellFormed(std::span<const char> form, int32 levelsLeft, int32& depth) {
    size_t totalSize = 0;
    if (levelsLeft == 0 || form.size() < kMessageHeaderSize ||
        read_message_header(form.data(), &totalSize) != B_OK || totalSize != form.size())
        return false;
    const uint32 fieldCount = ReadNumber<uint32>(form.data() + 12);
    std::span<const char> rest = form.subspan(kMessageHeaderSize);
    if (fieldCount > rest.size() / kFieldHeaderSize)
        return false;
    std::vector<std::string_view> names;
    names.reserve(fieldCount);
    depth = 1;
    for (uint32 index = 0; index < fieldCount; index++) {
        FieldView view;
        if (!TakeField(rest, view))
            return false;
        names.push_back(view.name);
        const bool nested = view.type == B_MESSAGE_TYPE;
        const bool itemsFit = ForEachItem(view, [&](std::span<const char> item) {
            int32 itemDepth = 0;
            if (nested && !IsWellFormed(item, levelsLeft - 1, itemDepth))
                return false;
            depth = std::max(depth, itemDepth + 1);
            return true;
        });
        if (!itemsFit)
            return false;
    }
    return rest.empty() && NamesAreUnique(names);
}

} // namespace

uint64 flattened_message_size(const MessageFields& fields) {
    uint64 size = kMessageHeaderSize;
    for (const MessageField& field : fields.All())
        size += kFieldHeaderSize + field.name.size() + ItemBlockSize(field);
    return size;
}

void flatten_message(uint32 what, const MessageFields& fields, char* buffer) {
    std::memcpy(buffer, kMagic, sizeof(kMagic));
    char* next = buffer + sizeof(kMagic);
    next = WriteNumber(next, static_cast<uint32>(flattened_message_size(fields)));
    next = WriteNumber(next, what);
    next = WriteNumber(next, static_cast<uint32>(fields.All().size()));
    for (const MessageField& field : fields.All()) {
        next = WriteNumber(next, uint32{field.type});
        next = WriteNumber(next, field.fixedSize ? kFixedSizeFlag : uint16{0});
        next = WriteNumber(next, static_cast<uint16>(field.name.size()));
        next = WriteNumber(next, field.CountItems());
        next = WriteNumber(next, static_cast<uint32>(ItemBlockSize(field)));
        next = WriteBytes(next, field.name);
        if (field.fixedSize) {
            next = WriteBytes(next, field.FixedItems());
            continue;
        }
        for (uint32 index = 0; index < field.CountItems(); index++) {
            const std::span<const char> item = field.ItemAt(index);
            next = WriteNumber(next, static_cast<uint32>(item.size()));
            next = WriteBytes(next, item);
        }
    }
}

status_t read_message_header(const char* header, size_t* totalSize) {
    if (std::memcmp(header, kMagic, sizeof(kMagic)) != 0)
        return B_NOT_A_MESSAGE;
    *totalSize = ReadNumber<uint32>(header + 4);
    return *totalSize >= kMessageHeaderSize && *totalSize <= kMaxMessageSize ? B_OK : B_BAD_DATA;
}

status_t unflatten_message(std::span<const char> form, uint32* what, MessageFields* fields) {
    if (form.size() < sizeof(kMagic) || std::memcmp(form.data(), kMagic, sizeof(kMagic)) != 0)
        return B_NOT_A_MESSAGE;
    int32 depth = 0;
    if (!IsWellFormed(form, kMaxMessageDepth, depth))
        return B_BAD_DATA;

    MessageFields result;
    std::span<const char> rest = form.subspan(kMessageHeaderSize);
    while (!rest.empty()) {
        FieldView view;
        if (!TakeField(rest, view))
            return B_BAD_DATA;
        MessageField field(view.name, view.type, view.fixedSize);
        if (view.fixedSize) {
            field.SetFixedItems(view.items, static_cast<uint32>(view.items.size() / view.count));
        } else {
            field.Reserve(view.count, view.items.size() - view.count * sizeof(uint32));
            // Alignment may push a form of close to two gigabytes past what a field holds.
            if (!ForEachItem(view, [&](std::span<const char> item) { return field.AddItem(item) == B_OK; }))
                return B_NO_MEMORY;
        }
        result.Append(std::move(field));
    }
    *what = ReadNumber<uint32>(form.data() + 8);
    *fields = std::move(result);
    return B_OK;
}

std::optional<int32> message_depth(std::span<const char> form) {
    int32 depth = 0;
    if (!IsWellFormed(form, kMaxMessageDepth, depth))
        return std::nullopt;
    return depth;
}
