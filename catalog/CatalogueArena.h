// Storage for the stars, systems and names of a catalogue: large blocks handed out in order,
// released all at once with the arena. A million stars would otherwise be two million small
// allocations, each with its own header and its own trip through the allocator.
#pragma once

#include "catalog/GravSystem.h"

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <new>
#include <type_traits>
#include <utility>
#include <vector>

class CatalogueArena {
public:
    CatalogueArena() = default;
    CatalogueArena(const CatalogueArena&) = delete;
    CatalogueArena& operator=(const CatalogueArena&) = delete;

    // A system or star built in the arena. Its owner ends it with GravSystem::Destroy, which
    // runs its destructor and leaves the storage to the arena; the arena must outlive it.
    template <class T, class... Arguments> T* Make(Arguments&&... arguments)
    {
        static_assert(std::is_base_of_v<GravSystem, T>);
        T* made = new (Allocate(sizeof(T), alignof(T))) T(std::forward<Arguments>(arguments)...);
        made->inArena = true;
        return made;
    }

    // A NUL-terminated copy of length characters of text, which lives as long as the arena.
    char* Keep(const char* text, size_t length)
    {
        auto* copy = static_cast<char*>(Allocate(length + 1, 1));
        std::memcpy(copy, text, length);
        copy[length] = '\0';
        return copy;
    }

    // Bytes of the blocks taken from the system so far.
    size_t Reserved() const { return fReserved; }

private:
    // Blocks double from the first size to the largest, as much again as the arena holds: a
    // catalogue of ten stars takes 64 KiB, not megabytes, and a million stars few blocks, the
    // last of which wastes little.
    static constexpr size_t kFirstBlock = size_t(64) << 10;
    static constexpr size_t kLargestBlock = size_t(4) << 20;
    static constexpr size_t kPage = 4096;
    // Blocks of this size or more start on a boundary of it, so that the system can map them
    // in pages of this size: a million stars fill 40 blocks, 80 large pages, where small pages
    // would be 40,000 faults, each a trip into the system.
    static constexpr size_t kLargePage = size_t(2) << 20;

    // Inline, as a million stars take three million pieces: the next piece of the last block
    // when it has room, otherwise one from a new block.
    void* Allocate(size_t size, size_t alignment)
    {
        // Alignments are powers of two.
        const size_t skip = -reinterpret_cast<uintptr_t>(fNext) & (alignment - 1);
        if (!fNext || skip + size > fLeft)
            return AllocateInNewBlock(size, alignment);
        std::byte* given = fNext + skip;
        fNext = given + size;
        fLeft -= skip + size;
        return given;
    }
    void* AllocateInNewBlock(size_t size, size_t alignment);

    struct FreeBlock {
        void operator()(std::byte* block) const;
    };
    std::vector<std::unique_ptr<std::byte[], FreeBlock>> fBlocks;
    std::byte* fNext = nullptr; // the free part of the last block
    size_t fLeft = 0; // bytes free there
    size_t fReserved = 0; // bytes of all the blocks
};
