// A named, numbered group of gravitationally bound members: the common base of star systems
// and stars.
#pragma once

#include "platform/BList.h"

#include <cstdint>

// Kind codes returned by WhatAmI().
enum : int32_t {
    kGravSystemKind = 0,
    kStarSystemKind = 1,
    kStarKind = 2,
};

// The name a system or star is built with: a text to copy (at most its first 79 characters
// are kept), or a text kept elsewhere that the system points at and never releases. A
// catalogue's million names live in one arena of its universe, each once, exactly as long as
// it is, and a system shares its primary star's.
struct GravName {
    GravName(const char* text) // NOLINT: a plain text is the usual name
        : text(text)
    {
    }
    // text is at most 79 characters and outlives the system named by it.
    static GravName Kept(char* text)
    {
        GravName name(text);
        name.kept = true;
        return name;
    }

    const char* text;
    bool kept = false;
};

class GravSystem : public BList {
public:
    GravSystem(GravName name, int32_t blockSize);
    // Destroys every member: a system owns the objects it lists.
    ~GravSystem() override;
    GravSystem(const GravSystem&) = delete;
    GravSystem& operator=(const GravSystem&) = delete;

    virtual int32_t WhatAmI() const { return kGravSystemKind; }

    int32_t GetID() const { return id; }
    const char* GetName() const { return name; }
    char* GetName() { return name; }
    void SetName(const char* newName); // keeps at most 79 characters

    // Ends a system or star that is owned: deletes it, or, when it was built in an arena,
    // runs its destructor only and leaves its storage to the arena.
    static void Destroy(GravSystem* system);

    // Serial numbers over the whole run, in order of construction of any system or star.
    static int32_t nextID;

    int32_t id;
    // Built in an arena (CatalogueArena), whose owner releases the storage: never deleted.
    bool inArena = false;
    // The name's characters were allocated for this system and are released with it.
    bool ownsName = false;
    // NUL-terminated, at most 79 characters. Not an inline buffer: a million stars and
    // systems with 80 bytes each would hold 150 MB of mostly unused name space.
    char* name;
};
