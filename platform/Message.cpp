// Named, typed message fields.
#include "platform/Message.h"

#include <cstring>

const Message::Field* Message::FindField(const char* name) const
{
    for (const Field& field : fFields) {
        if (field.name == name)
            return &field;
    }
    return nullptr;
}

template <typename T> status_t Message::Add(const char* name, T value)
{
    if (!name)
        return B_BAD_VALUE;
    for (Field& field : fFields) {
        if (field.name == name) {
            if (!std::holds_alternative<T>(field.values.front()))
                return B_BAD_TYPE;
            field.values.emplace_back(std::move(value));
            return B_OK;
        }
    }
    fFields.push_back(Field { name, { Value(std::move(value)) } });
    return B_OK;
}

template <typename T> status_t Message::Find(const char* name, int32_t index, const T** value) const
{
    const Field* field = name ? FindField(name) : nullptr;
    if (!field)
        return B_NAME_NOT_FOUND;
    if (!std::holds_alternative<T>(field->values.front()))
        return B_BAD_TYPE;
    if (index < 0 || index >= static_cast<int32_t>(field->values.size()))
        return B_BAD_INDEX;
    *value = &std::get<T>(field->values[index]);
    return B_OK;
}

status_t Message::AddInt32(const char* name, int32_t value)
{
    return Add<int32_t>(name, value);
}

status_t Message::AddPointer(const char* name, const void* pointer)
{
    return Add<const void*>(name, pointer);
}

status_t Message::AddString(const char* name, const char* string)
{
    return Add<std::string>(name, string ? string : "");
}

status_t Message::FindInt32(const char* name, int32_t index, int32_t* value) const
{
    const int32_t* found = nullptr;
    const status_t status = Find(name, index, &found);
    if (status == B_OK && value)
        *value = *found;
    return status;
}

status_t Message::FindPointer(const char* name, int32_t index, void** pointer) const
{
    const void* const* found = nullptr;
    const status_t status = Find(name, index, &found);
    if (status == B_OK && pointer)
        *pointer = const_cast<void*>(*found);
    return status;
}

status_t Message::FindString(const char* name, int32_t index, const char** string) const
{
    const std::string* found = nullptr;
    const status_t status = Find(name, index, &found);
    if (status == B_OK && string)
        *string = found->c_str();
    return status;
}

int32_t Message::FindInt32(const char* name) const
{
    int32_t value = 0;
    return FindInt32(name, 0, &value) == B_OK ? value : 0;
}

void* Message::FindPointer(const char* name) const
{
    void* pointer = nullptr;
    return FindPointer(name, 0, &pointer) == B_OK ? pointer : nullptr;
}

const char* Message::FindString(const char* name) const
{
    const char* string = "";
    return FindString(name, 0, &string) == B_OK ? string : "";
}

bool Message::HasInt32(const char* name, int32_t index) const
{
    return FindInt32(name, index, nullptr) == B_OK;
}

bool Message::HasPointer(const char* name, int32_t index) const
{
    return FindPointer(name, index, nullptr) == B_OK;
}

bool Message::HasString(const char* name, int32_t index) const
{
    return FindString(name, index, nullptr) == B_OK;
}

void Message::MakeEmpty()
{
    fFields.clear();
}

void Message::SetDropped(BPoint screenPoint)
{
    fDropped = true;
    fDropPoint = screenPoint;
}
