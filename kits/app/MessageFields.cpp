#include "MessageFields.h"

#include <cstring>
#include <utility>

namespace {

constexpr size_t kItemAlignment = 8;

size_t AlignedSize(size_t size) {
    return (size + kItemAlignment - 1) & ~(kItemAlignment - 1);
}

} // namespace

uint32 MessageField::CountItems() const {
    if (!fixedSize)
        return static_cast<uint32>(mPlaces.size());
    return mItemSize == 0 ? 0 : static_cast<uint32>(mBytes.size() / mItemSize);
}

std::span<const char> MessageField::ItemAt(uint32 index) const {
    if (fixedSize)
        return {mBytes.data() + size_t{index} * mItemSize, mItemSize};
    const Place& place = mPlaces[index];
    return {mBytes.data() + place.offset, place.size};
}

status_t MessageField::AddItem(std::span<const char> item) {
    if (item.empty())
        return B_BAD_VALUE;
    if (item.size() > kMaxMessageSize || mBytes.size() + item.size() + kItemAlignment > kMaxMessageSize)
        return B_NO_MEMORY;
    // An item of this very field would move while it is being added.
    if (item.data() >= mBytes.data() && item.data() < mBytes.data() + mBytes.size())
        return AddItem(std::vector<char>(item.begin(), item.end()));
    if (fixedSize) {
        if (mItemSize == 0)
            mItemSize = static_cast<uint32>(item.size());
        else if (mItemSize != item.size())
            return B_BAD_VALUE;
        mBytes.insert(mBytes.end(), item.begin(), item.end());
        return B_OK;
    }
    const size_t offset = AlignedSize(mBytes.size());
    mBytes.resize(offset);
    mBytes.insert(mBytes.end(), item.begin(), item.end());
    mPlaces.push_back({static_cast<uint32>(offset), static_cast<uint32>(item.size())});
    return B_OK;
}

status_t MessageField::ReplaceItem(uint32 index, std::span<const char> item) {
    if (item.empty())
        return B_BAD_VALUE;
    const std::span<const char> old = ItemAt(index);
    if (old.size() == item.size()) {
        std::memmove(mBytes.data() + (old.data() - mBytes.data()), item.data(), item.size());
        return B_OK;
    }
    if (fixedSize)
        return B_BAD_VALUE;
    if (item.size() > kMaxMessageSize || mBytes.size() + item.size() + kItemAlignment > kMaxMessageSize)
        return B_NO_MEMORY;
    Rebuild(index, item);
    return B_OK;
}

void MessageField::RemoveItem(uint32 index) {
    if (!fixedSize) {
        Rebuild(index, {});
        return;
    }
    const auto first = mBytes.begin() + static_cast<std::ptrdiff_t>(size_t{index} * mItemSize);
    mBytes.erase(first, first + mItemSize);
}

// Lays the items out anew with the one at `changedIndex` replaced, or left out when `item` is empty.
void MessageField::Rebuild(uint32 changedIndex, std::span<const char> item) {
    MessageField rebuilt(name, type, fixedSize);
    rebuilt.Reserve(CountItems(), mBytes.size() + item.size());
    for (uint32 index = 0; index < CountItems(); index++) {
        if (index != changedIndex)
            rebuilt.AddItem(ItemAt(index));
        else if (!item.empty())
            rebuilt.AddItem(item);
    }
    *this = std::move(rebuilt);
}

void MessageField::Reserve(uint32 items, size_t itemBytes) {
    if (!fixedSize)
        mPlaces.reserve(items);
    mBytes.reserve(itemBytes + (fixedSize ? 0 : size_t{items} * (kItemAlignment - 1)));
}

uint64 MessageField::ItemBytes() const {
    if (fixedSize)
        return mBytes.size();
    uint64 bytes = 0;
    for (const Place& place : mPlaces)
        bytes += place.size;
    return bytes;
}

void MessageField::SetFixedItems(std::span<const char> items, uint32 itemSize) {
    mItemSize = itemSize;
    mBytes.assign(items.begin(), items.end());
}

const MessageField* MessageFields::Find(std::string_view name) const {
    for (const MessageField& field : mFields) {
        if (field.name == name)
            return &field;
    }
    return nullptr;
}

MessageField* MessageFields::Find(std::string_view name) {
    return const_cast<MessageField*>(std::as_const(*this).Find(name));
}

status_t MessageFields::Add(std::string_view name, type_code type, bool fixedSize, std::span<const char> item,
                            uint32 expectedItems) {
    if (item.empty() || name.size() > kMaxFieldNameLength)
        return B_BAD_VALUE;
    if (MessageField* field = Find(name))
        return field->type == type ? field->AddItem(item) : B_BAD_TYPE;
    MessageField field(name, type, fixedSize);
    // A guess of the caller's may not cost more than a page.
    constexpr uint32 kMostExpected = 64;
    if (expectedItems > 1 && expectedItems <= kMostExpected && item.size() <= kMostExpected)
        field.Reserve(expectedItems, expectedItems * item.size());
    const status_t status = field.AddItem(item);
    if (status == B_OK)
        mFields.push_back(std::move(field));
    return status;
}

void MessageFields::Remove(const MessageField* field) {
    mFields.erase(mFields.begin() + (field - mFields.data()));
}
