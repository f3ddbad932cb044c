// Pointer list with block-wise, doubling growth and in-place storage of a single item.
#include "platform/BList.h"

#include <algorithm>
#include <bit>
#include <cstdlib>
#include <cstring>
#include <new>

BList::BList(int32_t blockSize)
    : fSingle(nullptr)
    , fBlockSize(std::max<int32_t>(blockSize, 1))
{
}

BList::BList(const BList& other)
    : fSingle(nullptr)
    , fBlockSize(other.fBlockSize)
{
    AddList(&other);
}

BList& BList::operator=(const BList& other)
{
    if (this != &other) {
        MakeEmpty();
        fBlockSize = other.fBlockSize;
        AddList(&other);
    }
    return *this;
}

BList::~BList()
{
    MakeEmpty();
}

int32_t BList::CapacityFor(int32_t count) const
{
    if (count <= 1)
        return 1;
    const uint32_t blocks = (static_cast<uint32_t>(count) + fBlockSize - 1) / fBlockSize;
    return std::max<int32_t>(2, static_cast<int32_t>(std::bit_ceil(blocks)) * fBlockSize);
}

// Moves the storage to the size newCount needs; the items up to min(old, new) count are kept.
void BList::Resize(int32_t newCount)
{
    const int32_t oldCapacity = CapacityFor(fCount);
    const int32_t newCapacity = CapacityFor(newCount);
    if (fCount > 1 && newCount > 1) {
        if (newCapacity != oldCapacity) {
            void* grown = std::realloc(fArray, sizeof(void*) * newCapacity);
            if (!grown)
                throw std::bad_alloc();
            fArray = static_cast<void**>(grown);
        }
    } else if (fCount <= 1 && newCount > 1) {
        void* single = fSingle;
        auto** array = static_cast<void**>(std::malloc(sizeof(void*) * newCapacity));
        if (!array)
            throw std::bad_alloc();
        array[0] = single;
        fArray = array;
    } else if (fCount > 1 && newCount <= 1) {
        void** array = fArray;
        fSingle = newCount == 1 ? array[0] : nullptr;
        std::free(array);
    }
    fCount = newCount;
}

bool BList::AddItem(void* item)
{
    return AddItem(item, fCount);
}

bool BList::AddItem(void* item, int32_t index)
{
    if (index < 0 || index > fCount)
        return false;
    Resize(fCount + 1);
    void** items = Items();
    std::memmove(items + index + 1, items + index, sizeof(void*) * (fCount - 1 - index));
    items[index] = item;
    return true;
}

bool BList::AddList(const BList* list)
{
    if (!list)
        return false;
    if (list == this) {
        const BList copy(*this);
        return AddList(&copy);
    }
    const int32_t start = fCount;
    const int32_t added = list->fCount;
    Resize(fCount + added);
    if (added > 0)
        std::memcpy(Items() + start, list->Items(), sizeof(void*) * added);
    return true;
}

bool BList::RemoveItem(void* item)
{
    const int32_t index = IndexOf(item);
    if (index < 0)
        return false;
    RemoveItem(index);
    return true;
}

void* BList::RemoveItem(int32_t index)
{
    if (index < 0 || index >= fCount)
        return nullptr;
    void** items = Items();
    void* removed = items[index];
    std::memmove(items + index, items + index + 1, sizeof(void*) * (fCount - 1 - index));
    Resize(fCount - 1);
    return removed;
}

bool BList::ReplaceItem(int32_t index, void* item)
{
    if (index < 0 || index >= fCount)
        return false;
    Items()[index] = item;
    return true;
}

bool BList::SwapItems(int32_t a, int32_t b)
{
    if (a < 0 || a >= fCount || b < 0 || b >= fCount)
        return false;
    std::swap(Items()[a], Items()[b]);
    return true;
}

void BList::MakeEmpty()
{
    if (fCount > 1)
        std::free(fArray);
    fSingle = nullptr;
    fCount = 0;
}

int32_t BList::IndexOf(const void* item) const
{
    void** items = Items();
    for (int32_t i = 0; i < fCount; i++) {
        if (items[i] == item)
            return i;
    }
    return -1;
}

void BList::SortItems(int (*compare)(const void*, const void*))
{
    if (fCount > 1)
        std::qsort(fArray, fCount, sizeof(void*), compare);
}
