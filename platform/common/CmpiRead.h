// Reading object paths and texts through the CMPI function tables.
//
// An object manager may answer any call with a null object, a dead handle, a short function
// table or a failure status. Each function here turns all of these into "nothing". Nothing
// is released: every object read belongs to the object manager.
#pragma once

#include <cmpidt.h>
#include <cmpift.h>

#include <optional>
#include <string_view>

namespace qelo::platform {

// Whether `object` can be asked anything at all.
template <typename Object> bool isLive(const Object* object) {
    return object != nullptr && object->hdl != nullptr && object->ft != nullptr;
}

// The text of `string`; valid as long as `string`.
std::optional<std::string_view> textOf(const CMPIString* string);

std::optional<std::string_view> classNameOf(const CMPIObjectPath* path);

std::optional<CMPICount> keyCountOf(const CMPIObjectPath* path);

struct Key {
    const char* name; // owned by the path
    CMPIData data;
};

// The key at `position`, counted from 0.
std::optional<Key> keyAt(const CMPIObjectPath* path, CMPICount position);

// The value of the key `name`; nothing where the path has no such key.
std::optional<CMPIData> keyNamed(const CMPIObjectPath* path, const char* name);

// The 25 characters of `dateTime`.
std::optional<std::string_view> textOf(const CMPIDateTime* dateTime);

} // namespace qelo::platform
