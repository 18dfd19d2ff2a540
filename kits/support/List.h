// BList: a growing array of pointers.
#pragma once

#include <SupportDefs.h>

#include <vector>

// An ordered array of item pointers. The list never owns the items. Indices run from 0 to CountItems() - 1;
// a method that is given another index, or finds nothing, answers null, false or -1 and changes nothing.
// Not synchronised: one thread at a time.
class BList {
  public:
    // `count` is the number of items that room is made for at first.
    explicit BList(int32 count = 20);
    BList(const BList& other);
    BList(BList&& other) noexcept;
    virtual ~BList();

    BList& operator=(const BList& other);
    BList& operator=(BList&& other) noexcept;
    bool operator==(const BList& other) const;
    bool operator!=(const BList& other) const { return !(*this == other); }

    bool AddItem(void* item);
    // `index` may be CountItems(), which appends.
    bool AddItem(void* item, int32 index);
    bool AddList(const BList* list);
    bool AddList(const BList* list, int32 index);

    // Removes the first occurrence of `item`.
    bool RemoveItem(void* item);
    // Removes and answers the item at `index`.
    void* RemoveItem(int32 index);
    bool RemoveItems(int32 index, int32 count);
    bool ReplaceItem(int32 index, void* item);
    void MakeEmpty();

    void SortItems(int (*compare)(const void* first, const void* second));
    bool SwapItems(int32 indexA, int32 indexB);
    // Takes an item out and puts it back so that it ends up at `to`.
    bool MoveItem(int32 from, int32 to);

    void* ItemAt(int32 index) const;
    void* FirstItem() const;
    void* LastItem() const;
    // Like ItemAt(), but an index outside the list is undefined behaviour.
    void* ItemAtFast(int32 index) const { return mItems[static_cast<size_t>(index)]; }
    // The array itself, valid until the list changes; null when the list is empty.
    void* Items() const;

    int32 IndexOf(void* item) const;
    int32 IndexOf(const void* item) const;
    bool HasItem(void* item) const;
    bool HasItem(const void* item) const;
    int32 CountItems() const;
    bool IsEmpty() const;

    // Calls the function for each item until it answers true.
    void DoForEach(bool (*function)(void* item));
    void DoForEach(bool (*function)(void* item, void* argument), void* argument);

  private:
    std::vector<void*> mItems;
};
