// Naming, numbering and owning members.
#include "catalog/GravSystem.h"

#include <cstring>

namespace {

// Names are kept to this many characters.
constexpr size_t kMaxName = 79;

} // namespace

int32_t GravSystem::nextID = 0;

GravSystem::GravSystem(GravName newName, int32_t blockSize)
    : BList(blockSize)
    , id(nextID++)
    , name(nullptr)
{
    if (newName.kept)
        name = const_cast<char*>(newName.text);
    else
        SetName(newName.text);
}

GravSystem::~GravSystem()
{
    const int32_t count = CountItems();
    for (int32_t i = 0; i < count; i++)
        Destroy(static_cast<GravSystem*>(ItemAtFast(i)));
    if (ownsName)
        delete[] name;
}

void GravSystem::SetName(const char* newName)
{
    // The new text may be part of the old one: copied before the old is released.
    const size_t length = newName ? strnlen(newName, kMaxName) : 0;
    char* copy = new char[length + 1];
    if (length > 0)
        std::memcpy(copy, newName, length);
    copy[length] = '\0';
    if (ownsName)
        delete[] name;
    name = copy;
    ownsName = true;
}

void GravSystem::Destroy(GravSystem* system)
{
    if (system && system->inArena)
        system->~GravSystem();
    else
        delete system;
}
