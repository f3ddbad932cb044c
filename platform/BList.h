// An ordered list of untyped pointers that grows in blocks. The list owns its array, never
// the items.
//
// Sixteen bytes, because a million star systems and their stars each carry one: a list of
// at most one item keeps it in place of the array pointer and allocates nothing, and the
// capacity is not stored but follows from the count (blocks of blockSize, the number of blocks
// doubling), so appending a million items copies the array a handful of times, not two
// hundred.
#pragma once

#include <cstdint>

class BList {
public:
    explicit BList(int32_t blockSize = 20);
    BList(const BList& other);
    BList& operator=(const BList& other);
    virtual ~BList();

    bool AddItem(void* item);
    bool AddItem(void* item, int32_t index); // false when index is outside 0..CountItems()
    bool AddList(const BList* list);
    bool RemoveItem(void* item); // the first occurrence
    void* RemoveItem(int32_t index); // the item, or null when index is out of range
    bool ReplaceItem(int32_t index, void* item);
    bool SwapItems(int32_t a, int32_t b);
    void MakeEmpty();

    // Null outside the range. Inline: queries and renderers call it for every system.
    void* ItemAt(int32_t index) const
    {
        return index >= 0 && index < fCount ? Items()[index] : nullptr;
    }
    void* ItemAtFast(int32_t index) const { return Items()[index]; }
    void* FirstItem() const { return ItemAt(0); }
    void* LastItem() const { return ItemAt(fCount - 1); }
    int32_t IndexOf(const void* item) const; // -1 when absent
    bool HasItem(const void* item) const { return IndexOf(item) >= 0; }
    int32_t CountItems() const { return fCount; }
    bool IsEmpty() const { return fCount == 0; }
    // The items, contiguous; valid until the list changes.
    void** Items() const { return fCount > 1 ? fArray : const_cast<void**>(&fSingle); }
    void SortItems(int (*compare)(const void*, const void*));

    // Slots the list has room for before it must grow again.
    int32_t Capacity() const { return CapacityFor(fCount); }

private:
    int32_t CapacityFor(int32_t count) const;
    void Resize(int32_t newCount);

    union {
        void** fArray; // when fCount > 1
        void* fSingle; // when fCount <= 1
    };
    int32_t fCount = 0;
    int32_t fBlockSize;
};
