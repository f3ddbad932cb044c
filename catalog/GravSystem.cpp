// Naming, numbering and owning members.
#include "catalog/GravSystem.h"

#include <cstring>

int32_t GravSystem::nextID = 0;

GravSystem::GravSystem(const char* newName, int32_t blockSize)
    : BList(blockSize)
    , id(nextID++)
{
    SetName(newName);
}

GravSystem::~GravSystem()
{
    const int32_t count = CountItems();
    for (int32_t i = 0; i < count; i++)
        delete static_cast<GravSystem*>(ItemAtFast(i));
}

void GravSystem::SetName(const char* newName)
{
    const size_t length = newName ? strnlen(newName, sizeof(name) - 1) : 0;
    std::memcpy(name, newName, length);
    name[length] = '\0';
}
