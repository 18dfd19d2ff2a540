#include <List.h>

#include <algorithm>
#include <cstdlib>

BList::BList(int32 count) {
    if (count > 0)
        mItems.reserve(static_cast<size_t>(count));
}

BList::BList(const BList& other) = default;

BList::BList(BList&& other) noexcept = default;

BList::~BList() = default;

BList& BList::operator=(const BList& other) = default;

BList& BList::operator=(BList&& other) noexcept = default;

bool BList::operator==(const BList& other) const {
    return mItems == other.mItems;
}

bool BList::AddItem(void* item) {
    mItems.push_back(item);
    return true;
}

bool BList::AddItem(void* item, int32 index) {
    if (index < 0 || index > CountItems())
        return false;
    mItems.insert(mItems.begin() + index, item);
    return true;
}

bool BList::AddList(const BList* list) {
    return AddList(list, CountItems());
}

bool BList::AddList(const BList* list, int32 index) {
    if (list == nullptr || index < 0 || index > CountItems())
        return false;
    // The list may be this one.
    const std::vector<void*> added = list->mItems;
    mItems.insert(mItems.begin() + index, added.begin(), added.end());
    return true;
}

bool BList::RemoveItem(void* item) {
    const int32 index = IndexOf(item);
    if (index < 0)
        return false;
    mItems.erase(mItems.begin() + index);
    return true;
}

void* BList::RemoveItem(int32 index) {
    if (index < 0 || index >= CountItems())
        return nullptr;
    void* const item = mItems[static_cast<size_t>(index)];
    mItems.erase(mItems.begin() + index);
    return item;
}

bool BList::RemoveItems(int32 index, int32 count) {
    if (index < 0 || count < 0 || index > CountItems() - count)
        return false;
    mItems.erase(mItems.begin() + index, mItems.begin() + index + count);
    return true;
}

bool BList::ReplaceItem(int32 index, void* item) {
    if (index < 0 || index >= CountItems())
        return false;
    mItems[static_cast<size_t>(index)] = item;
    return true;
}

void BList::MakeEmpty() {
    mItems.clear();
}

void BList::SortItems(int (*compare)(const void* first, const void* second)) {
    if (compare != nullptr && mItems.size() > 1)
        std::qsort(mItems.data(), mItems.size(), sizeof(void*), compare);
}

bool BList::SwapItems(int32 indexA, int32 indexB) {
    if (indexA < 0 || indexA >= CountItems() || indexB < 0 || indexB >= CountItems())
        return false;
    std::swap(mItems[static_cast<size_t>(indexA)], mItems[static_cast<size_t>(indexB)]);
    return true;
}

bool BList::MoveItem(int32 from, int32 to) {
    if (from < 0 || from >= CountItems() || to < 0 || to >= CountItems())
        return false;
    const auto first = mItems.begin();
    if (from < to)
        std::rotate(first + from, first + from + 1, first + to + 1);
    else
        std::rotate(first + to, first + from, first + from + 1);
    return true;
}

void* BList::ItemAt(int32 index) const {
    return index < 0 || index >= CountItems() ? nullptr : mItems[static_cast<size_t>(index)];
}

void* BList::FirstItem() const {
    return mItems.empty() ? nullptr : mItems.front();
}

void* BList::LastItem() const {
    return mItems.empty() ? nullptr : mItems.back();
}

void* BList::Items() const {
    return mItems.empty() ? nullptr : const_cast<void**>(mItems.data());
}

int32 BList::IndexOf(void* item) const {
    return IndexOf(static_cast<const void*>(item));
}

int32 BList::IndexOf(const void* item) const {
    const auto found = std::find(mItems.begin(), mItems.end(), item);
    return found == mItems.end() ? -1 : static_cast<int32>(found - mItems.begin());
}

bool BList::HasItem(void* item) const {
    return IndexOf(item) >= 0;
}

bool BList::HasItem(const void* item) const {
    return IndexOf(item) >= 0;
}

int32 BList::CountItems() const {
    return static_cast<int32>(mItems.size());
}

bool BList::IsEmpty() const {
    return mItems.empty();
}

void BList::DoForEach(bool (*function)(void* item)) {
    if (function == nullptr)
        return;
    // The function may change the list.
    for (int32 index = 0; index < CountItems(); index++) {
        if (function(ItemAtFast(index)))
            return;
    }
}

void BList::DoForEach(bool (*function)(void* item, void* argument), void* argument) {
    if (function == nullptr)
        return;
    for (int32 index = 0; index < CountItems(); index++) {
        if (function(ItemAtFast(index), argument))
            return;
    }
}
