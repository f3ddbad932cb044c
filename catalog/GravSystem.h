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

class GravSystem : public BList {
public:
    GravSystem(const char* name, int32_t blockSize);
    // Destroys every member: a system owns the objects it lists.
    ~GravSystem() override;
    GravSystem(const GravSystem&) = delete;
    GravSystem& operator=(const GravSystem&) = delete;

    virtual int32_t WhatAmI() const { return kGravSystemKind; }

    int32_t GetID() const { return id; }
    const char* GetName() const { return name; }
    char* GetName() { return name; }
    void SetName(const char* newName); // keeps at most 79 characters

    // Serial numbers over the whole run, in order of construction of any system or star.
    static int32_t nextID;

    int32_t id;
    char name[80];
};
