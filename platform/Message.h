// A message between windows: a 32-bit command code and named, typed fields. Plain C++: the
// posting and dragging of messages is the Qt side's business (platform/qt/).
#pragma once

#include "platform/BPoint.h"
#include "platform/Kernel.h"

#include <cstdint>
#include <string>
#include <variant>
#include <vector>

constexpr status_t B_NAME_NOT_FOUND = INT32_MIN + 0x6005;
constexpr status_t B_BAD_TYPE = INT32_MIN + 0x6006;
constexpr status_t B_BAD_INDEX = INT32_MIN + 0x6007;

class Message {
public:
    explicit Message(uint32_t what = 0)
        : what(what)
    {
    }

    // A name may hold several values of one type; they are numbered from 0 in the order added.
    // Adding a value of another type under a name already used is refused (B_BAD_TYPE).
    status_t AddInt32(const char* name, int32_t value);
    status_t AddPointer(const char* name, const void* pointer);
    status_t AddString(const char* name, const char* string);

    status_t FindInt32(const char* name, int32_t index, int32_t* value) const;
    status_t FindInt32(const char* name, int32_t* value) const { return FindInt32(name, 0, value); }
    status_t FindPointer(const char* name, int32_t index, void** pointer) const;
    status_t FindPointer(const char* name, void** pointer) const
    {
        return FindPointer(name, 0, pointer);
    }
    // The string stays valid as long as the message and its fields do.
    status_t FindString(const char* name, int32_t index, const char** string) const;
    status_t FindString(const char* name, const char** string) const
    {
        return FindString(name, 0, string);
    }

    // Missing fields read as 0, null and the empty string.
    int32_t FindInt32(const char* name) const;
    void* FindPointer(const char* name) const;
    const char* FindString(const char* name) const;

    bool HasInt32(const char* name, int32_t index = 0) const;
    bool HasPointer(const char* name, int32_t index = 0) const;
    bool HasString(const char* name, int32_t index = 0) const;
    int32_t CountFields() const { return static_cast<int32_t>(fFields.size()); }
    void MakeEmpty();

    // A message that arrived by drag and drop knows it, and where it was let go (screen
    // coordinates).
    bool WasDropped() const { return fDropped; }
    BPoint DropPoint() const { return fDropPoint; }
    void SetDropped(BPoint screenPoint);

    uint32_t what;

private:
    using Value = std::variant<int32_t, const void*, std::string>;
    struct Field {
        std::string name;
        std::vector<Value> values; // all of one type
    };

    const Field* FindField(const char* name) const;
    template <typename T> status_t Add(const char* name, T value);
    template <typename T> status_t Find(const char* name, int32_t index, const T** value) const;

    std::vector<Field> fFields;
    bool fDropped = false;
    BPoint fDropPoint;
};
