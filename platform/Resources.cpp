// Resources.cpp: the registry behind ReadResource. Registration happens at start-up; reads may
// come from any thread, so both go through one mutex (reads are rare: bitmaps load once).
#include "platform/Resources.h"

#include <algorithm>
#include <cstring>
#include <map>
#include <mutex>
#include <utility>

namespace {

struct Block {
    const void* data; // not owned
    size_t size;
};

std::mutex& RegistryLock()
{
    static std::mutex lock;
    return lock;
}

std::map<std::pair<uint32_t, int32_t>, Block>& Registry()
{
    static std::map<std::pair<uint32_t, int32_t>, Block> registry;
    return registry;
}

} // namespace

void RegisterResource(uint32_t type, int32_t id, const void* data, size_t size)
{
    std::lock_guard guard(RegistryLock());
    Registry()[{ type, id }] = Block { data, size };
}

bool ResourcesAvailable()
{
    std::lock_guard guard(RegistryLock());
    return !Registry().empty();
}

int64_t ReadResource(uint32_t type, int32_t id, void* buffer, size_t offset, size_t length)
{
    std::lock_guard guard(RegistryLock());
    const auto found = Registry().find({ type, id });
    if (found == Registry().end())
        return -1;
    const Block& block = found->second;
    if (offset >= block.size || length == 0)
        return 0;
    const size_t count = std::min(length, block.size - offset);
    std::memcpy(buffer, static_cast<const uint8_t*>(block.data) + offset, count);
    return int64_t(count);
}

int64_t ResourceSize(uint32_t type, int32_t id)
{
    std::lock_guard guard(RegistryLock());
    const auto found = Registry().find({ type, id });
    return found == Registry().end() ? -1 : int64_t(found->second.size);
}
