// Handing out the arena's blocks.
#include "catalog/CatalogueArena.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <sys/mman.h>

void* CatalogueArena::AllocateInNewBlock(size_t size, size_t alignment)
{
    // Every request is far smaller than a block, and a block's start is aligned for any
    // object. The block comes from the heap, where leak checkers look for the pointers its
    // objects hold. Every page of it will be written: where the system can, they are all
    // mapped in one call rather than one page fault each, and in large pages when the block
    // is large.
    const size_t bytes = std::clamp(fReserved, kFirstBlock, kLargestBlock);
    const bool large = bytes >= kLargePage;
    std::unique_ptr<std::byte[], FreeBlock> owned(
        static_cast<std::byte*>(std::aligned_alloc(large ? kLargePage : kPage, bytes)));
    if (!owned)
        throw std::bad_alloc();
    std::byte* block = owned.get();
    fBlocks.push_back(std::move(owned));
#ifdef MADV_HUGEPAGE
    if (large)
        madvise(block, bytes, MADV_HUGEPAGE);
#endif
#ifdef MADV_POPULATE_WRITE
    madvise(block, bytes, MADV_POPULATE_WRITE);
#endif
    fNext = block;
    fLeft = bytes;
    fReserved += bytes;
    return Allocate(size, alignment);
}

void CatalogueArena::FreeBlock::operator()(std::byte* block) const
{
    std::free(block);
}
