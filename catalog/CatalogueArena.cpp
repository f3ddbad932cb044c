// Handing out the arena's blocks.
#include "catalog/CatalogueArena.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <sys/mman.h>

void* CatalogueArena::Allocate(size_t size, size_t alignment)
{
    // Alignments are powers of two.
    const size_t skip = -reinterpret_cast<uintptr_t>(fNext) & (alignment - 1);
    if (!fNext || skip + size > fLeft) {
        // Every request is far smaller than a block, and a block's start is aligned for any
        // object. The block comes from the heap, where leak checkers look for the pointers
        // its objects hold. Every page of it will be written: where the system can, they are
        // all mapped in one call rather than one page fault each.
        const size_t bytes = std::clamp(fReserved, kFirstBlock, kLargestBlock);
        std::unique_ptr<std::byte[], FreeBlock> owned(
            static_cast<std::byte*>(std::aligned_alloc(kPage, bytes)));
        if (!owned)
            throw std::bad_alloc();
        std::byte* block = owned.get();
        fBlocks.push_back(std::move(owned));
#ifdef MADV_POPULATE_WRITE
        madvise(block, bytes, MADV_POPULATE_WRITE);
#endif
        fNext = block;
        fLeft = bytes;
        fReserved += bytes;
        return Allocate(size, alignment);
    }
    std::byte* given = fNext + skip;
    fNext = given + size;
    fLeft -= skip + size;
    return given;
}

void CatalogueArena::FreeBlock::operator()(std::byte* block) const
{
    std::free(block);
}

char* CatalogueArena::Keep(const char* text, size_t length)
{
    auto* copy = static_cast<char*>(Allocate(length + 1, 1));
    std::memcpy(copy, text, length);
    copy[length] = '\0';
    return copy;
}
